#pragma once

#include <cstdio>
#include <string>
#include <vector>

namespace senseloom::tool {

// Shows a recording that is still written, until its end or until it is left. Throws InputError as TraceReader and
// Replayer do.
void watchTrace(std::FILE* out, const std::string& file);

// Runs a program, records it in no file and shows the recording. On a terminal the program's standard input is empty.
// Ends with the status of the recording: throws ExitStatus.
void watchProgram(std::FILE* out, const std::vector<std::string>& command);

}  // namespace senseloom::tool
