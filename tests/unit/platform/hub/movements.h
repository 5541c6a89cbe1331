// Movements made up, as the hub's detectors take them: a sample each 20 ms.
#pragma once

#include <sample.h>

#include <cmath>
#include <cstddef>
#include <cstdint>

// A phone that lies flat and swings upwards and downwards, at the sample with this number. In mm/s².
inline hub::Axes swinging(std::int64_t sample, double perSecond, double amplitude) {
  const double phase = 2 * 3.14159265358979 * perSecond * static_cast<double>(sample) / 50;
  return {0, 0, 9807 + static_cast<std::int32_t>(std::lround(amplitude * std::sin(phase)))};
}

constexpr hub::Axes kLying = {0, 0, 9807};
