#pragma once

#include <sys/types.h>

#include <cstdio>

#include "record/recording.h"

namespace senseloom::tool {

// Records a running process until the user interrupts it or the process ends. Throws ExitStatus as runRecorded() does,
// and InputError when the process cannot be recorded.
void recordAttached(std::FILE* out, const RecordingArguments& arguments, pid_t process);

}  // namespace senseloom::tool
