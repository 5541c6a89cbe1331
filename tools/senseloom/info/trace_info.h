#pragma once

#include <cstdio>
#include <string>

namespace senseloom::tool {

// Prints what a trace holds, without replaying it: what a recording says of itself, the calls and the sensors, the
// time, what is missing, and the sessions that are never closed and property lists that are never released. Throws
// InputError as TraceReader does.
void printInfo(std::FILE* out, const std::string& trace, bool json);

}  // namespace senseloom::tool
