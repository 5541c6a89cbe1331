#include "step_detector.h"

#include <algorithm>

namespace hub {
namespace {

constexpr std::int64_t kLeastHeight = 400;  // mm/s²
constexpr std::int64_t kShortest = 15;      // intervals from step to step: 0.3 s
constexpr std::int64_t kLongest = 75;       // 1.5 s; more than that and the row ends

}  // namespace

std::span<const std::int64_t> StepDetector::take(const Axes& acceleration) {
  ++now;
  smoothed.add(magnitude(acceleration));
  smoother.add(smoothed.mean());
  const std::int64_t value = smoother.mean();
  recent.add(value);
  if (!findPeak(value)) return {};
  inARow = peak - lastPeak <= kLongest ? inARow + 1 : 1;
  lastPeak = peak;
  steps[(inARow - 1) % kInARow] = peak;
  if (inARow < kInARow) return {};
  const std::size_t found = inARow == kInARow ? kInARow : 1;
  if (found == 1) steps[0] = peak;
  for (std::size_t i = 0; i < found; ++i) steps[i] = now - steps[i];
  return std::span(steps).first(found);
}

// Whether a step ended with this value.
bool StepDetector::findPeak(std::int64_t value) {
  const std::int64_t above = value - recent.mean();
  const std::int64_t least = std::max(kLeastHeight, root(recent.variance()) * 2 / 5);
  if (!isArmed) {
    isArmed = above < 0;
    return false;
  }
  if (above > least && above > height) {
    height = above;
    peak = now;
  }
  if (height == 0 || above >= height - least) return false;
  height = 0;
  isArmed = false;
  return peak - lastPeak >= kShortest;
}

}  // namespace hub
