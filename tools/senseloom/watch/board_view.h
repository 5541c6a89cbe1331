#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

#include "watch/board.h"

namespace senseloom::tool {

// How a person looks at the board.
struct BoardView {
  size_t sortedBy = 0;  // 0: in opening order; else the column, from 1 on
  bool isReversed = false;
  std::string filter = {};  // rows without this text, in upper or lower case, are left out
  bool isTypingFilter = false;
  bool isPaused = false;
  size_t firstRow = 0;  // of those that are left, at the top of the screen

  bool operator==(const BoardView&) const = default;
};

// What keys may ask for beside another view.
enum class Leaving { no, byQuitting, byInterrupt };

// Does what keys, bytes from a terminal, ask for: `view` changes as they say.
Leaving pressKeys(std::string_view keys, BoardView& view);

struct ScreenSize {
  size_t width = 80;
  size_t height = 24;
};

// The lines of a screen: a title, the headings, the rows that there is room for, and in the last line what the keys do.
// There are no more lines than the screen has, and none is wider. If `view.firstRow` is further down than need be to
// show the last row, it becomes less.
std::vector<std::string> screenLines(const std::string& title, const std::vector<BoardRow>& rows, BoardView& view,
                                     const ScreenSize& size);

}  // namespace senseloom::tool
