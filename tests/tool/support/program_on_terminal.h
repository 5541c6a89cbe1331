#pragma once

#include <sys/types.h>
#include <termios.h>

#include <functional>
#include <string>
#include <vector>

#include "run_tool.h"

namespace senseloom::tool {

// A program with a terminal of its own, of 80 columns and 24 lines, for standard output, standard error and keys. Its
// standard input is the terminal as well, or a pipe that the test writes.
class ProgramOnTerminal {
 public:
  ProgramOnTerminal(std::vector<std::string> command, const Environment& environment, bool hasPipe);
  // Ends it, if it has not ended.
  ~ProgramOnTerminal();
  ProgramOnTerminal(const ProgramOnTerminal&) = delete;
  ProgramOnTerminal& operator=(const ProgramOnTerminal&) = delete;

  // A line for the pipe.
  void tell(const std::string& line) const;
  void endInput();
  void press(const std::string& keys) const;

  // Waits for a screen with this text, and returns it without control sequences; fails the test after a minute.
  std::string screenWith(const std::string& text);
  // All that the terminal got so far.
  const std::string& output() const { return text; }

  // Waits for its end; a minute at most. Returns what waitpid() tells.
  int finish();
  // Whether the terminal's modes are what they were at first.
  bool isTerminalAsBefore() const;

 private:
  // Takes what the program has written, for a tenth of a second at most.
  void read();
  // The last screen that is complete.
  std::string screen() const;

  pid_t process = 0;
  int terminal;  // the test's end
  int programsEnd;
  int pipeEnd = -1;
  termios before{};
  std::string text;
};

}  // namespace senseloom::tool
