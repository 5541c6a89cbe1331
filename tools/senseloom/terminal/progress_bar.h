#pragma once

#include <chrono>
#include <cstdint>
#include <cstdio>

namespace senseloom::tool {

// A bar on a terminal that shows how much of some work is done. It leaves the cursor at the start of its line, so that
// whatever else is printed overwrites it. Its destructor removes it.
class ProgressBar {
 public:
  using Clock = std::chrono::steady_clock;

  ProgressBar(std::FILE* stream, uint64_t whole, Clock::time_point (*timeSource)() = Clock::now)
      : terminal(stream), total(whole), now(timeSource) {}
  ~ProgressBar();
  ProgressBar(const ProgressBar&) = delete;
  ProgressBar& operator=(const ProgressBar&) = delete;

  // Draws the bar if it was not drawn within the last tenth of a second.
  void show(uint64_t done);

 private:
  std::FILE* terminal;
  uint64_t total;
  Clock::time_point (*now)();
  Clock::time_point nextDrawing = Clock::time_point::min();
};

}  // namespace senseloom::tool
