#pragma once

#include <cstdio>
#include <optional>
#include <string>
#include <vector>

#include "explain/explainer.h"
#include "explain/log_capture.h"
#include "trace/call_filter.h"
#include "trace/replayer.h"
#include "trace/trace_reader.h"
#include "watch/board.h"
#include "watch/board_view.h"
#include "watch/held_output.h"
#include "watch/terminal_screen.h"

namespace senseloom::tool {

// Shows a replay on a screen, if there is a terminal, while it goes on, and afterwards what became of the records. What
// else is printed meanwhile comes when the screen was left.
//
// The keys that end it send this process the signal that does the same: SIGTERM or SIGINT.
class LiveBoard final : public ReplayObserver {
 public:
  // `heading` says what is watched.
  LiveBoard(std::FILE* out, std::string heading);
  // What is shown of the trace, which is replayed next. Throws InputError as CallFilter does.
  void begin(const FilterArguments& filterArguments, const TraceReader& trace);

  void onOutcome(const CallOutcome& outcome) override;
  void onEnd() override { explainer.onEnd(); }

  // Reads keys and draws the screen, unless that was done within the last tenth of a second.
  void refresh();
  bool hasScreen() const { return screen.has_value(); }
  // Whether the key for it was pressed.
  bool wasQuit() const { return isQuit; }

  // Leaves the screen, and prints what became of all records.
  void finish();

 private:
  void obeyKeys();

  std::FILE* const out;
  const std::string title;
  LogCapture log;
  Board board;
  Explainer explainer;
  std::optional<CallFilter> filter;  // from begin() on
  BoardView view;
  std::vector<BoardRow> rows;  // as they are shown
  Board::Clock::time_point nextRefresh = Board::Clock::time_point::min();
  bool isQuit = false;
  std::optional<HeldOutput> held;
  std::optional<TerminalScreen> screen;
};

}  // namespace senseloom::tool
