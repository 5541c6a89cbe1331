// What was learned from recordings: see scripts/learn_digits.py.
#pragma once

#include <array>
#include <cstdint>
#include <span>

#include "drawing.h"

namespace gesture {

struct Template {
  int digit;
  // The values of the points one after the other, a character each: '@' is 0, 'A' is 1 and so on, '>' is -1, '=' is -2
  // and so on. ('?' is left out, since two of them can mean something else in a program.)
  char values[kPoints * kAxes + 1];
};

Points pointsOf(const Template& learned);

struct SizeRange {
  std::uint32_t least;
  std::uint32_t most;
};

std::span<const Template> templates();
extern const std::array<std::uint32_t, 10> kLimits;  // the most that a digit's nearest template may be away
extern const SizeRange kAccelerationRange;           // of Drawing::accelerationSize
extern const SizeRange kRateRange;                   // of Drawing::rateSize

}  // namespace gesture
