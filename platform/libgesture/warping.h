#pragma once

#include <cstdint>

#include "drawing.h"

namespace gesture {

// How far two drawings are apart: the least sum of the distances of points that are matched in order of time, each with
// one or more of the other, by dynamic time warping (Sakoe and Chiba, "Dynamic programming algorithm optimization for
// spoken word recognition", 1978). Points match that are at most six apart; their distance is Euclid's, in eighths of
// the unit of their values. Above `most`, any number above it.
std::uint32_t warpingDistance(const Points& a, const Points& b, std::uint32_t most);

}  // namespace gesture
