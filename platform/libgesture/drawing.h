// What the engine compares of a record: its movement, freed of how fast, how large and at which tilt it was drawn.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>

namespace gesture {

constexpr std::size_t kAxes = 6;          // acceleration in x, y, z (1/1000 g), angular rate about x, y, z (mrad/s)
constexpr std::size_t kLeastGroups = 16;  // of a record that can be a drawing
constexpr std::size_t kMostGroups = 170;  // likewise
constexpr std::size_t kLeastMoving = 12;  // groups between the still ends of a drawing
constexpr std::size_t kPoints = 24;
constexpr int kMostValue = 27;  // values of points are clipped to this size

using Group = std::array<std::int16_t, kAxes>;
using Point = std::array<std::int8_t, kAxes>;
using Points = std::array<Point, kPoints>;

struct Drawing {
  // Equally long parts of the movement, in order of time: the mean of each axis there, less its mean over the whole
  // movement, in units that make the root mean square 10, of the acceleration and of the angular rate alike.
  Points points;
  // The root mean squares that were scaled away.
  std::uint32_t accelerationSize;  // in 1/1000 g
  std::uint32_t rateSize;          // in mrad/s
};

// Nothing if the record is too short or too long, or if too little of it moves. scripts/learn_digits.py computes the
// same; all in integers, so that every processor finds the same.
std::optional<Drawing> describe(std::span<const Group> record);

// The same as drawn in a mirror: left and right change places, and so does the sense of turning about the other axes.
Points mirrored(const Points& points);

}  // namespace gesture
