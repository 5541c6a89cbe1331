#pragma once

#include <cstdio>
#include <string>
#include <vector>

#include "record/recording.h"

namespace senseloom::tool {

// Runs the program of a command line, with its calls of the library recorded. Its standard output is `out`, unless that
// is where the recording goes; then it is standard error. Throws ExitStatus, with the program's or, when it succeeded
// and nothing was recorded, kNothingRecorded; InputError when the program cannot be started or recorded.
inline constexpr int kNothingRecorded = 3;
[[noreturn]] void runRecorded(std::FILE* out, const RecordingArguments& arguments,
                              const std::vector<std::string>& command);

}  // namespace senseloom::tool
