#pragma once

#include <cstdio>
#include <string>
#include <vector>

namespace senseloom::tool {

// exec()s the program of a command line, with its calls of the library recorded in a file, which is emptied first. The
// program's standard output is `out`. Throws InputError when the program cannot be started.
[[noreturn]] void startRecorded(std::FILE* out, const std::string& file, std::vector<std::string> command);

}  // namespace senseloom::tool
