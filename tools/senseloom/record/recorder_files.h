#pragma once

#include <string>

namespace senseloom::tool {

// What LD_AUDIT has to name for a program of a word size, 32 or 64. Where the recording libraries of both word sizes
// are installed, as Debian has them side by side, it serves programs of either that the program starts. Where there is
// none for the program, it serves programs of the other word size that it starts, as a shell would, and a warning says
// so. Throws InputError where there is none at all.
std::string auditLibrary(int bits);

}  // namespace senseloom::tool
