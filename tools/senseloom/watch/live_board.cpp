#include "watch/live_board.h"

#include <chrono>
#include <csignal>
#include <utility>

#include "explain/account_table.h"

namespace senseloom::tool {
namespace {

constexpr std::chrono::milliseconds kInterval(100);

}  // namespace

LiveBoard::LiveBoard(std::FILE* output, std::string heading)
    : out(output), title(std::move(heading)), explainer(board, log) {
  if (!TerminalScreen::isPossible(out)) return;
  held.emplace();
  screen.emplace(out);
}

void LiveBoard::begin(const FilterArguments& filterArguments, const TraceReader& trace) {
  filter.emplace(filterArguments, trace);
}

void LiveBoard::onOutcome(const CallOutcome& outcome) {
  board.choose(filter->takes(outcome));
  explainer.onOutcome(outcome);
  board.onOutcome(outcome);
  refresh();
}

void LiveBoard::refresh() {
  if (!screen) return;
  const auto now = Board::Clock::now();
  if (now < nextRefresh) return;
  obeyKeys();
  board.measure(now);
  if (!view.isPaused) rows = board.rows();
  screen->show(screenLines(title, rows, view, screen->size()));
  nextRefresh = Board::Clock::now() + kInterval;  // however long it took
}

void LiveBoard::obeyKeys() {
  const Leaving leaving = pressKeys(screen->takeKeys(), view);
  if (leaving == Leaving::no) return;
  isQuit = leaving == Leaving::byQuitting;
  std::raise(isQuit ? SIGTERM : SIGINT);
}

void LiveBoard::finish() {
  screen.reset();
  held.reset();
  printAccounts(out, board.accounts(), false);
}

}  // namespace senseloom::tool
