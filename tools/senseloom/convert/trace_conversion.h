#pragma once

#include <cstdio>
#include <string>

namespace senseloom::tool {

struct TraceConversion {
  std::string trace;
  std::string to;    // "perfetto" or "csv"
  std::string file;  // empty: standard output
};

// Replays a trace and writes what came of it in a form that other programs read. Throws InputError as TraceReader and
// Replayer do, and std::runtime_error if the file cannot be written.
void convertTrace(std::FILE* out, const TraceConversion& conversion);

}  // namespace senseloom::tool
