#pragma once

#include <cstdio>
#include <string>

#include "trace/call_filter.h"

namespace senseloom::tool {

// Prints what a trace holds of the calls that a filter takes, without replaying it: what a recording says of itself,
// the calls and the sensors, the time, what is missing, and the sessions that are never closed and property lists that
// are never released. Throws InputError as TraceReader does.
void printInfo(std::FILE* out, const std::string& trace, const FilterArguments& filter, bool json);

}  // namespace senseloom::tool
