// Makes samples that are equally far apart of those that a phone delivers as it can.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>

#include "sample.h"

namespace hub {

constexpr std::int64_t kInterval = 20'000;  // microseconds from one sample to the next: 50 a second

// Computes the mean of each interval, where the values change linearly from one sample to the next. So a fast sensor is
// smoothed and a slow one interpolated. In integers, so that every processor finds the same.
class Resampler {
 public:
  // Nobody knows what happened in a gap longer than this, in microseconds.
  static constexpr std::int64_t kGap = 300'000;

  struct Taken {
    // The intervals that ended, in order of time, each with the time of its end. They stay until the next call.
    std::span<const Sample> intervals;
    // There was a gap, or other sensors than before: intervals are counted anew from this sample on.
    bool startedOver = false;
  };
  // Leaves out a sample that is not later than the one before.
  Taken take(const Sample& sample);

 private:
  static constexpr std::size_t kChannels = 7;
  using Channels = std::array<std::int64_t, kChannels>;

  static Channels channelsOf(const Sample& sample);
  Channels valuesAt(std::int64_t time, const Sample& next) const;
  void integrateTo(std::int64_t time, const Sample& next);
  Sample endInterval();

  std::optional<Sample> previous;
  std::int64_t begin = 0;       // of the interval
  std::int64_t integrated = 0;  // what is in `areas` ends here
  Channels areas{};             // twice the integral of each value over the interval so far
  std::array<Sample, kGap / kInterval + 1> ended{};
};

}  // namespace hub
