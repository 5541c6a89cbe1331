// Means over the last values of a signal, in integers: each step takes the same short time, and every processor finds
// the same.
#pragma once

#include <array>
#include <cmath>
#include <cstddef>
#include <cstdint>

#include "sample.h"

namespace hub {

// The integer part. Exact, since a double holds any integer below 2^53 and its root is rounded correctly.
inline std::int64_t root(std::int64_t square) {
  return static_cast<std::int64_t>(std::sqrt(static_cast<double>(square)));
}

// The length of a vector.
inline std::int64_t magnitude(const Axes& axes) {
  std::int64_t squares = 0;
  for (const std::int32_t axis : axes) squares += std::int64_t{axis} * axis;
  return root(squares);
}

// The sum, and the sum of squares, of the last kCount values.
template <std::size_t kCount>
class RunningSums {
 public:
  void add(std::int64_t value) {
    std::int64_t& place = values[next];
    next = (next + 1) % kCount;
    if (count == kCount) {
      total -= place;
      squares -= place * place;
    } else {
      ++count;
    }
    place = value;
    total += value;
    squares += value * value;
  }
  bool isFull() const { return count == kCount; }
  std::int64_t sum() const { return total; }
  // Of those that there are; there has to be one.
  std::int64_t mean() const { return total / static_cast<std::int64_t>(count); }
  std::int64_t variance() const {
    const auto n = static_cast<std::int64_t>(count);
    return (n * squares - total * total) / (n * n);
  }

 private:
  std::array<std::int64_t, kCount> values{};
  std::size_t next = 0;
  std::size_t count = 0;
  std::int64_t total = 0;
  std::int64_t squares = 0;
};

}  // namespace hub
