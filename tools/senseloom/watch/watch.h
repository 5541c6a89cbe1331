#pragma once

#include <cstdio>
#include <string>
#include <vector>

#include "trace/call_filter.h"

namespace senseloom::tool {

// Shows what a filter takes of a recording that is still written, until its end or until it is left. Throws InputError
// as TraceReader and Replayer do.
void watchTrace(std::FILE* out, const std::string& file, const FilterArguments& filter);

// Runs a program, records it in no file and shows what a filter takes of the recording. On a terminal the program's
// standard input is empty. Ends with the status of the recording: throws ExitStatus.
void watchProgram(std::FILE* out, const std::vector<std::string>& command, const FilterArguments& filter);

}  // namespace senseloom::tool
