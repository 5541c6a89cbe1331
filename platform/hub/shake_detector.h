// Tells when the phone is shaken.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

#include "resampler.h"
#include "running_sums.h"

namespace hub {

// A shake is a row of reversals along one axis, each soon after the one before: the acceleration without its mean of
// the last second, smoothed over 60 ms, goes beyond a limit on one side, then on the other. A person who runs with the
// phone reaches the same accelerations, but does not reverse them so often in a row.
class ShakeDetector {
 public:
  // 0 to 2: the higher, the gentler a movement that counts.
  explicit ShakeDetector(int sensitivity);

  // Takes the acceleration in the next interval. True once a shake, when it is sure.
  bool take(const Axes& acceleration);

 private:
  struct Axis {
    RunningSums<3> smoothed;
    RunningSums<50> recent;
    int side = 0;               // beyond the limit at last: 1, -1; 0: never yet
    std::int64_t reversal = 0;  // the interval of the last one
    int inARow = 0;
  };

  bool reverses(Axis& axis, std::int64_t acceleration) const;

  std::int64_t limit;    // of the acceleration, in mm/s²
  std::int64_t longest;  // intervals from a reversal to the next
  std::array<Axis, 3> axes;
  std::int64_t now = 0;
  std::int64_t shaken;  // the interval in which the last shake was sure
};

}  // namespace hub
