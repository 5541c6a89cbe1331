#include "warping.h"

#include <algorithm>
#include <array>
#include <cstddef>

namespace gesture {
namespace {

constexpr std::size_t kBand = 6;
constexpr std::uint32_t kFar = 1U << 20;  // more than the longest way: 47 points at 8 * 54 * sqrt(6)
constexpr std::size_t kMostSquares = kAxes * (2 * kMostValue) * (2 * kMostValue);

// Eight times the root of each sum of squares, rounded down.
constexpr auto kRoots = [] {
  std::array<std::uint16_t, kMostSquares + 1> roots{};
  std::uint32_t root = 0;
  for (std::uint32_t squares = 0; squares <= kMostSquares; ++squares) {
    while ((root + 1) * (root + 1) <= 64 * squares) ++root;
    roots[squares] = static_cast<std::uint16_t>(root);
  }
  return roots;
}();

std::uint32_t distance(const Point& a, const Point& b) {
  int squares = 0;
  for (std::size_t axis = 0; axis < kAxes; ++axis) squares += (a[axis] - b[axis]) * (a[axis] - b[axis]);
  return kRoots[static_cast<std::size_t>(squares)];
}

}  // namespace

std::uint32_t warpingDistance(const Points& a, const Points& b, std::uint32_t most) {
  // The row of the table for one point of a: at j + 1, the least sum of a way that ends in matching it with b[j].
  std::array<std::uint32_t, kPoints + 1> row;
  row.fill(kFar);
  row[0] = 0;
  for (std::size_t i = 0; i < kPoints; ++i) {
    const std::size_t begin = i < kBand ? 0 : i - kBand;
    const std::size_t end = std::min(i + kBand + 1, kPoints);
    std::uint32_t diagonal = row[begin];  // of the row before
    std::uint32_t left = kFar;
    std::uint32_t least = kFar;
    for (std::size_t j = begin; j < end; ++j) {
      const std::uint32_t above = row[j + 1];
      left = distance(a[i], b[j]) + std::min({diagonal, above, left});
      diagonal = above;
      row[j + 1] = left;
      least = std::min(least, left);
    }
    if (least > most) return least;  // sums only grow
    row[begin] = kFar;               // outside the next row's band, or left of its first point
  }
  return row[kPoints];
}

}  // namespace gesture
