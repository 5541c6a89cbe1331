#pragma once

#include <string>

namespace senseloom::tool {

// Finds the file that a command starts, as a shell would, and what the dynamic linker will run: that file, or the
// interpreter of a script. Returns its word size, 32 or 64.
//
// Throws InputError if there is no such program, and if it cannot be recorded: it is linked statically, or it runs with
// the privileges of its file, for which the linker loads nothing that it was not built with.
int wordSizeOf(const std::string& command);

}  // namespace senseloom::tool
