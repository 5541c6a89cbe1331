#include "movement_finder.h"

#include <algorithm>
#include <limits>
#include <utility>

namespace hub {
namespace {

constexpr std::int64_t kStillRate = 150;  // mrad/s; a hand that holds still turns the phone less than that
constexpr std::size_t kStillness = 75;  // intervals that end a movement: 1.5 s; drawings have pauses shorter than that
constexpr std::size_t kLeastMoving = 20;  // intervals: 0.4 s
constexpr std::size_t kMargin = 5;        // groups that are kept on both sides of a movement: 0.2 s

std::int16_t limited(std::int64_t value) {
  using Limits = std::numeric_limits<std::int16_t>;
  return static_cast<std::int16_t>(std::clamp<std::int64_t>(value, Limits::min(), Limits::max()));
}

// The mean of two accelerations in 1/1000 of standard gravity, 9.80665 m/s², rounded down.
std::int16_t milligravities(std::int64_t first, std::int64_t second) {
  const std::int64_t hundredths = (first + second) * 100'000;
  constexpr std::int64_t kDivisor = 2 * 980'665;
  return limited((hundredths - (hundredths < 0 ? kDivisor - 1 : 0)) / kDivisor);
}

}  // namespace

Movement MovementFinder::take(const Sample& sample) {
  append(sample);
  if (moves(sample)) {
    isMoving = true;
    ++moving;
    still = 0;
    return {};
  }
  if (isMoving && ++still >= kStillness) return endMovement();
  return {};
}

Movement MovementFinder::finish() {
  return isMoving ? endMovement() : Movement{};
}

bool MovementFinder::moves(const Sample& sample) {
  rates.add(magnitude(*sample.rate));
  return rates.mean() > kStillRate;
}

void MovementFinder::append(const Sample& sample) {
  const Axes& a = sample.acceleration;
  const Axes& g = *sample.rate;
  const std::array<std::int32_t, 6> values{a[0], a[1], a[2], g[0], g[1], g[2]};
  if (!std::exchange(hasHalf, !hasHalf)) {
    half = values;
    return;
  }
  Group group{};
  for (std::size_t i = 0; i < group.size(); ++i) {
    group[i] = i < 3 ? milligravities(half[i], values[i]) : limited((half[i] + values[i]) / 2);
  }
  if (!isMoving && groups.size() == kMargin) groups.erase(groups.begin());
  if (groups.size() <= kMostGroups + kStillness) groups.push_back(group);  // more is too long in any case
}

Movement MovementFinder::endMovement() {
  Movement found = std::exchange(groups, {});
  const std::size_t behind = still / 2;
  if (behind > kMargin) found.resize(found.size() - std::min(found.size(), behind - kMargin));
  const bool isSensible = moving >= kLeastMoving && found.size() <= kMostGroups;
  isMoving = false;
  moving = still = 0;
  return isSensible ? found : Movement{};
}

}  // namespace hub
