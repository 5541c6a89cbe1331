#pragma once

#include <sys/types.h>

#include <string>
#include <utility>
#include <vector>

#include "exit_status.h"

namespace senseloom::tool {

// A program that the tool has started. While it runs, the tool does not end by signals that ask it to: those that a
// process sends are passed on, those from the keyboard the program gets by itself.
class ChildProgram {
 public:
  // Variables that it gets beside those of the tool, with their values.
  using Environment = std::vector<std::pair<std::string, std::string>>;

  // `in` and `out` become its standard input and output. Throws InputError when it cannot be started.
  ChildProgram(std::vector<std::string> command, const Environment& environment, int in, int out);
  ChildProgram(const ChildProgram&) = delete;
  ChildProgram& operator=(const ChildProgram&) = delete;

  // Whether it has ended.
  bool hasEnded();
  ExitStatus status() const;
  // The signal that ended it, as text; empty if none did.
  std::string cause() const;

 private:
  pid_t process = 0;
  int waitStatus = 0;
  bool isOver = false;
};

}  // namespace senseloom::tool
