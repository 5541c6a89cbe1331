#include "replay/replay_progress.h"

#include <unistd.h>

#include <cstdint>

namespace senseloom::tool {
namespace {

constexpr uint64_t kLongTrace = 1 << 20;

}  // namespace

void ReplayProgress::onOutcome(const CallOutcome& outcome) {
  output->onOutcome(outcome);
  bar->show(trace.bytesRead());
}

void ReplayProgress::onEnd() {
  bar.reset();
  output->onEnd();
}

std::unique_ptr<ReplayObserver> withProgress(std::unique_ptr<ReplayObserver> output, const TraceReader& trace,
                                             std::FILE* out, bool isFilling) {
  const bool isShown = trace.size() >= kLongTrace && isatty(STDERR_FILENO) && !(isFilling && isatty(fileno(out)));
  if (!isShown) return output;
  return std::make_unique<ReplayProgress>(std::move(output), trace, stderr);
}

}  // namespace senseloom::tool
