#pragma once

#include <termios.h>

#include <cstdio>
#include <string>
#include <vector>

#include "watch/board_view.h"

namespace senseloom::tool {

// A terminal that one program fills as a whole: its second screen, so that what was on the first one comes back. Keys
// reach the program one by one, Ctrl-C among them. The destructor leaves the terminal as it was.
class TerminalScreen {
 public:
  // Whether `out` is a terminal that can do that, and that keys can be read from.
  static bool isPossible(std::FILE* out);

  explicit TerminalScreen(std::FILE* out);
  ~TerminalScreen();
  TerminalScreen(const TerminalScreen&) = delete;
  TerminalScreen& operator=(const TerminalScreen&) = delete;

  // 80 columns of 24 lines if the terminal does not say.
  ScreenSize size() const;
  // The keys that were pressed since the last call.
  std::string takeKeys() const;
  // Shows lines in place of what is there.
  void show(const std::vector<std::string>& lines);

 private:
  void write(const std::string& text) const;

  const int terminal;
  termios before{};
  std::string shown;
};

}  // namespace senseloom::tool
