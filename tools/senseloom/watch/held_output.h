#pragma once

#include <cstdio>

namespace senseloom::tool {

// Holds back, as long as it lives, what this program and those that it starts print on standard output and standard
// error, where that is a terminal; then it is printed.
class HeldOutput {
 public:
  // Throws std::runtime_error when there is no room to keep it.
  HeldOutput();
  ~HeldOutput();
  HeldOutput(const HeldOutput&) = delete;
  HeldOutput& operator=(const HeldOutput&) = delete;

 private:
  std::FILE* held = nullptr;
  int output = -1;  // duplicates of what they were before
  int errors = -1;
};

}  // namespace senseloom::tool
