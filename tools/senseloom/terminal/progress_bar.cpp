#include "terminal/progress_bar.h"

#include <algorithm>

namespace senseloom::tool {
namespace {

constexpr int kCells = 20;
constexpr int kWidth = kCells + 7;  // the brackets and " 100%"
constexpr char kFull[] = "====================";
constexpr std::chrono::milliseconds kInterval(100);

}  // namespace

ProgressBar::~ProgressBar() {
  if (nextDrawing != Clock::time_point::min()) std::fprintf(terminal, "%*s\r", kWidth, "");
}

void ProgressBar::show(uint64_t done) {
  const auto time = now();
  if (time < nextDrawing) return;
  nextDrawing = time + kInterval;
  const double share = std::min(1.0, static_cast<double>(done) / static_cast<double>(total));
  std::fprintf(terminal, "[%-*.*s] %3d%%\r", kCells, static_cast<int>(kCells * share), kFull,
               static_cast<int>(100 * share));
}

}  // namespace senseloom::tool
