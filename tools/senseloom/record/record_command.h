#pragma once

#include <cstdio>
#include <string>
#include <vector>

namespace senseloom::tool {

// Becomes the program that a command line starts, with its calls of the library recorded in a file, which is emptied
// first. `out` is what the program gets as its standard output. Throws InputError when the program can not be started
// so.
[[noreturn]] void record(std::FILE* out, const std::string& file, std::vector<std::string> command);

}  // namespace senseloom::tool
