#pragma once

#include <cstdio>
#include <string>
#include <vector>

#include "trace/call_filter.h"

namespace senseloom::tool {

// What the user says about a page.
struct ViewArguments {
  std::string trace;
  std::string page = {};        // its file; empty: standard output
  std::string classNames = {};  // for readClassNames(); empty: those of the trace
  FilterArguments filter = {};  // what the page shows; the whole trace is replayed
};

// Replays a trace and writes the page of it, to `out` if no file is given. Throws InputError as TraceReader and
// Replayer do, or when the page would replace the trace, and std::runtime_error if the file cannot be written.
void view(std::FILE* out, const ViewArguments& arguments);

}  // namespace senseloom::tool
