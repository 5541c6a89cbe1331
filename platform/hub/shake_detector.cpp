#include "shake_detector.h"

namespace hub {
namespace {

constexpr std::int64_t kPause = 50;  // intervals from a shake to another, which may be one along another axis
constexpr int kInARow = 12;          // reversals: those of a second and a half at 4 a second

struct Sensitivity {
  std::int64_t limit;    // mm/s²
  std::int64_t longest;  // intervals from a reversal to the next
};
// A gentle shake has to be faster, because people walk and run that gently.
constexpr std::array<Sensitivity, 3> kSensitivities{{{16'000, 8}, {12'000, 8}, {8'000, 7}}};

const Sensitivity& rowOf(int sensitivity) {
  return kSensitivities[static_cast<std::size_t>(sensitivity < 0 || sensitivity > 2 ? 1 : sensitivity)];
}

}  // namespace

ShakeDetector::ShakeDetector(int sensitivity)
    : limit(rowOf(sensitivity).limit), longest(rowOf(sensitivity).longest), axes(), shaken(-kPause) {}

bool ShakeDetector::take(const Axes& acceleration) {
  ++now;
  bool isShaken = false;
  for (std::size_t i = 0; i < axes.size(); ++i) {
    Axis& axis = axes[i];
    if (!reverses(axis, acceleration[i])) continue;
    axis.inARow = now - axis.reversal <= longest ? axis.inARow + 1 : 1;
    axis.reversal = now;
    isShaken = isShaken || axis.inARow == kInARow;
  }
  if (!isShaken || now - shaken < kPause) return false;
  shaken = now;
  return true;
}

bool ShakeDetector::reverses(Axis& axis, std::int64_t acceleration) const {
  axis.recent.add(acceleration);
  axis.smoothed.add(acceleration);
  const std::int64_t value = axis.smoothed.mean() - axis.recent.mean();
  const int side = value > limit ? 1 : (value < -limit ? -1 : 0);
  const bool isReversed = side == -axis.side && side != 0;
  if (side != 0) axis.side = side;
  return isReversed;
}

}  // namespace hub
