#pragma once

#include <sys/types.h>

#include <cstdio>

namespace senseloom::tool {

// Prints, for each sensor with sessions in a process, its last property list, and for each session what it asked for
// last and how many records it was given and results it got. Throws InputError as ProcessControl does.
void printStatus(std::FILE* out, pid_t process);

}  // namespace senseloom::tool
