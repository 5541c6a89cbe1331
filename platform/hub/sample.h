// What the hub is fed, and what it computes with.
#pragma once

#include <array>
#include <cstdint>
#include <optional>

namespace hub {

using Axes = std::array<std::int32_t, 3>;  // x, y, z

// What the phone's sensors say at one time.
struct Sample {
  std::int64_t time;                     // in microseconds
  Axes acceleration;                     // as an accelerometer reads it, in mm/s²: 9807 upwards at rest
  std::optional<Axes> rate;              // angular rate, in mrad/s
  std::optional<std::int32_t> pressure;  // of the air, in Pa
};

// Values beyond are cut to this size: more than phones can sense, and small enough for all that is computed from them.
constexpr std::int32_t kMostValue = 1 << 20;

}  // namespace hub
