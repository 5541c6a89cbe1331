// Finds steps.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <span>

#include "resampler.h"
#include "running_sums.h"

namespace hub {

// A step is a peak of the acceleration's magnitude, smoothed twice, that rises above the mean of the last two seconds
// by at least a part of the deviation there, and falls off again: peak detection as in Brajdic and Harle, "Walk
// detection and step counting on unconstrained smartphones" (2013). A single peak may be anything; steps count from
// eight in a row on, and then those before, too.
class StepDetector {
 public:
  // Takes the acceleration in the next interval. Returns how many intervals ago each of the steps was that it found, in
  // order of time; most often none. They stay until the next call.
  std::span<const std::int64_t> take(const Axes& acceleration);

 private:
  static constexpr std::size_t kInARow = 8;

  bool findPeak(std::int64_t value);

  RunningSums<10> smoothed;
  RunningSums<5> smoother;
  RunningSums<100> recent;
  std::int64_t now = 0;     // number of the interval
  bool isArmed = true;      // the signal was below its mean since the last peak
  std::int64_t height = 0;  // of the highest value of a peak so far, above the mean
  std::int64_t peak = 0;    // when that was
  std::int64_t lastPeak = -1'000;
  std::size_t inARow = 0;
  std::array<std::int64_t, kInARow> steps{};
};

}  // namespace hub
