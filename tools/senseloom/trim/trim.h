#pragma once

#include <cstdio>
#include <string>

#include "trace/call_filter.h"

namespace senseloom::tool {

// Writes the part of a trace whose records a filter takes, to a file, or to `out` if it has no name. The part replays
// alone: all opens, options and closes up to its end stay, of the sensors concerned, since every session has its say in
// what they negotiate. So do the records that a session has gathered for its next result, without their outcome. If
// sessions are named, their sensors are concerned; if failed calls are wanted, those of such calls.
// Throws InputError as TraceReader does, and when the trace is standard input but has to be read twice: when sessions
// are named or failed calls are wanted; and when there are none of those.
void trim(std::FILE* out, const std::string& trace, const std::string& file, const FilterArguments& filter);

}  // namespace senseloom::tool
