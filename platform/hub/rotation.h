// Directions, in integers, so that every processor walks the same way.
#pragma once

#include <cstdint>

namespace hub {

constexpr std::int64_t kHalfTurn = 3'141'592'654;  // in nanoradians

struct Direction {
  std::int64_t cosine;  // in millionths
  std::int64_t sine;
};

// Of an angle in nanoradians, from -kHalfTurn to kHalfTurn; right within some millionths. By the method of Volder, "The
// CORDIC trigonometric computing technique" (1959).
Direction directionOf(std::int64_t angle);

}  // namespace hub
