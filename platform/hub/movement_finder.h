// Finds movements of the hand between two moments of stillness, such as drawings in the air.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <vector>

#include "resampler.h"
#include "running_sums.h"

namespace hub {

// Acceleration in x, y and z in 1/1000 of standard gravity, angular rate about them in mrad/s: as the gesture engine
// has them.
using Group = std::array<std::int16_t, 6>;
using Movement = std::vector<Group>;  // 25 a second

class MovementFinder {
 public:
  static constexpr std::size_t kMostGroups = 170;  // of a movement: 6.8 s; longer ones are left out

  // Takes the next interval, which has an angular rate. Returns the movement that it ends; most often an empty one.
  Movement take(const Sample& sample);
  // No more intervals come. Returns the movement that ends with that, or an empty one.
  Movement finish();

 private:
  bool moves(const Sample& sample);
  void append(const Sample& sample);
  Movement endMovement();

  RunningSums<5> rates;
  Movement groups;                     // of the movement, with what was just before it; before one, what was just now
  std::array<std::int32_t, 6> half{};  // of a group: the first of its two intervals
  bool hasHalf = false;
  bool isMoving = false;
  std::size_t moving = 0;  // intervals of the movement that were not still
  std::size_t still = 0;   // intervals since the phone last moved
};

}  // namespace hub
