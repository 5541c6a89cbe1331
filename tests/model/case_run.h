#pragma once

#include <string>

#include "case_file.h"

namespace oracle {

// Makes the calls of a case on the library and on the model, each as it is when it was loaded. Returns what the first
// call that differs from what is expected did otherwise, with its line, for people; empty when all is as expected.
std::string run(const Case& one, const std::string& file);

}  // namespace oracle
