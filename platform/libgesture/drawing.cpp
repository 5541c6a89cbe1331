#include "drawing.h"

#include <algorithm>
#include <cmath>

namespace gesture {
namespace {

constexpr int kRootMeanSquare = 10;  // of the points, in units of their values
constexpr int kFraction = 16;        // units of a mean value while it is computed

using Means = std::array<std::array<std::int64_t, kAxes>, kPoints>;

// The integer part. Exact, since a double holds any integer this large (below 2^53) and its root is rounded correctly.
std::int64_t root(std::int64_t square) {
  return static_cast<std::int64_t>(std::sqrt(static_cast<double>(square)));
}

// Rounds down; the divisor is positive.
std::int64_t quotient(std::int64_t dividend, std::int64_t divisor) {
  return (dividend - (dividend < 0 ? divisor - 1 : 0)) / divisor;
}

std::int64_t angularRate(const Group& group) {
  std::int64_t squares = 0;
  for (std::size_t axis = 3; axis < kAxes; ++axis) squares += std::int64_t{group[axis]} * group[axis];
  return root(squares);
}

// The record without the still groups at both ends: those that turn, smoothed over five, at less than a twentieth of
// the rate that 95 % of the groups stay below. The first and last groups count twice and thrice at the ends.
std::span<const Group> movingPart(std::span<const Group> record) {
  std::array<std::int64_t, kMostGroups> motion{};
  const auto last = static_cast<std::ptrdiff_t>(record.size()) - 1;
  for (std::ptrdiff_t i = 0; i <= last; ++i) {
    std::int64_t sum = 0;
    for (std::ptrdiff_t j = i - 2; j <= i + 2; ++j) {
      sum += angularRate(record[static_cast<std::size_t>(std::clamp<std::ptrdiff_t>(j, 0, last))]);
    }
    motion[static_cast<std::size_t>(i)] = sum;
  }
  auto sorted = motion;
  const auto high = sorted.begin() + last * 19 / 20;
  std::nth_element(sorted.begin(), high, sorted.begin() + last + 1);
  const auto moves = [&](std::int64_t value) { return value * 20 > *high; };

  const auto begin = motion.begin();
  const auto end = begin + last + 1;
  const auto first = std::find_if(begin, end, moves);
  if (first == end) return {};
  const auto behind = std::find_if(std::make_reverse_iterator(end), std::make_reverse_iterator(begin), moves).base();
  return record.subspan(static_cast<std::size_t>(first - begin), static_cast<std::size_t>(behind - first));
}

// The mean of each axis in each of the points' equally long parts, less the mean of them all, in 1/kFraction.
Means meansOf(std::span<const Group> moving) {
  const std::size_t count = moving.size();
  // In units of 1/kPoints of a group: group i spans kPoints units, point p spans `count` units.
  Means sums{};
  for (std::size_t i = 0; i < count; ++i) {
    const std::size_t begin = i * kPoints;
    const std::size_t end = begin + kPoints;
    for (std::size_t p = begin / count; p * count < end; ++p) {
      const std::size_t overlap = std::min(end, (p + 1) * count) - std::max(begin, p * count);
      for (std::size_t axis = 0; axis < kAxes; ++axis) {
        sums[p][axis] += static_cast<std::int64_t>(overlap) * moving[i][axis];
      }
    }
  }
  for (std::size_t axis = 0; axis < kAxes; ++axis) {
    std::int64_t total = 0;
    for (const auto& sum : sums) total += sum[axis];
    for (auto& sum : sums) {
      const std::int64_t deviation = static_cast<std::int64_t>(kPoints) * sum[axis] - total;
      sum[axis] = quotient(deviation * kFraction, static_cast<std::int64_t>(kPoints * count));
    }
  }
  return sums;
}

// Scales three axes from `axis` on to the root mean square of points, and returns what it was; 0 if nothing changes.
std::uint32_t scale(const Means& means, std::size_t axis, Points& points) {
  std::int64_t squares = 0;
  for (const auto& mean : means) {
    for (std::size_t a = axis; a < axis + 3; ++a) squares += mean[a] * mean[a];
  }
  const std::int64_t size = root(squares / static_cast<std::int64_t>(3 * kPoints));
  if (size == 0) return 0;
  for (std::size_t p = 0; p < kPoints; ++p) {
    for (std::size_t a = axis; a < axis + 3; ++a) {
      const std::int64_t value = quotient(2 * kRootMeanSquare * means[p][a] + size, 2 * size);  // rounded
      points[p][a] = static_cast<std::int8_t>(std::clamp<std::int64_t>(value, -kMostValue, kMostValue));
    }
  }
  return static_cast<std::uint32_t>(size / kFraction);
}

}  // namespace

std::optional<Drawing> describe(std::span<const Group> record) {
  if (record.size() < kLeastGroups || record.size() > kMostGroups) return std::nullopt;
  const auto moving = movingPart(record);
  if (moving.size() < kLeastMoving) return std::nullopt;

  const Means means = meansOf(moving);
  Drawing drawing{};
  drawing.accelerationSize = scale(means, 0, drawing.points);
  drawing.rateSize = scale(means, 3, drawing.points);
  if (drawing.accelerationSize == 0 || drawing.rateSize == 0) return std::nullopt;
  return drawing;
}

Points mirrored(const Points& points) {
  Points result = points;
  for (Point& point : result) {
    for (const std::size_t axis : {0U, 4U, 5U}) point[axis] = static_cast<std::int8_t>(-point[axis]);
  }
  return result;
}

}  // namespace gesture
