#include "recogniser.h"

#include <algorithm>
#include <utility>

#include "templates.h"
#include "warping.h"

namespace gesture {
namespace {

// The blank at the end belongs to the name.
constexpr std::array<const char*, 10> kNames = {"NumberZero ",  "NumberOne ",  "NumberTwo ", "NumberThree ",
                                                "NumberFour ",  "NumberFive ", "NumberSix ", "NumberSeven ",
                                                "NumberEight ", "NumberNine "};

// A drawing that is nearly as far from another digit as from the nearest is neither: 31/32 is as far as it may be.
constexpr std::uint32_t kRatioOfDistances = 31;
constexpr std::uint32_t kRatioOfDistancesBase = 32;

// Digits that stay the same in a mirror may be drawn either way round.
bool isSymmetric(int digit) {
  return digit == 0 || digit == 8;
}

bool contains(const SizeRange& range, std::uint32_t size) {
  return range.least <= size && size <= range.most;
}

// The distance to the nearest template of each digit; for those too far away to matter, any number that says so.
std::array<std::uint32_t, kNames.size()> distancesToDigits(const Points& drawn) {
  const Points mirror = mirrored(drawn);
  std::array<std::uint32_t, kNames.size()> distances;
  // What is beyond the ratio at the largest limit decides nothing.
  std::uint32_t matters = *std::max_element(kLimits.begin(), kLimits.end()) * kRatioOfDistancesBase / kRatioOfDistances;
  distances.fill(matters + 1);
  for (const Template& learned : templates()) {
    const Points points = pointsOf(learned);
    std::uint32_t& nearest = distances[static_cast<std::size_t>(learned.digit)];
    nearest = std::min(nearest, warpingDistance(drawn, points, std::min(nearest, matters)));
    if (isSymmetric(learned.digit)) {
      nearest = std::min(nearest, warpingDistance(mirror, points, std::min(nearest, matters)));
    }
    matters = std::min(matters, nearest * kRatioOfDistancesBase / kRatioOfDistances);
  }
  return distances;
}

}  // namespace

std::optional<int> recognise(std::span<const Group> record) {
  const auto drawing = describe(record);
  if (!drawing || !contains(kAccelerationRange, drawing->accelerationSize) ||
      !contains(kRateRange, drawing->rateSize)) {
    return std::nullopt;
  }
  auto distances = distancesToDigits(drawing->points);
  const auto digit = static_cast<std::size_t>(std::min_element(distances.begin(), distances.end()) - distances.begin());
  const std::uint32_t nearest = std::exchange(distances[digit], UINT32_MAX);
  const std::uint32_t next = *std::min_element(distances.begin(), distances.end());
  const bool clear = nearest * kRatioOfDistancesBase <= next * kRatioOfDistances;
  if (nearest > kLimits[digit] || !clear) return std::nullopt;
  return static_cast<int>(digit);
}

const char* Recogniser::take(const std::int16_t* group, bool last) {
  if (count < kMostGroups) std::copy_n(group, kAxes, groups[count].begin());
  count = std::min(count + 1, kMostGroups + 1);
  if (!last) return nullptr;
  const std::size_t length = std::exchange(count, 0);
  if (length > kMostGroups) return nullptr;
  const auto digit = recognise(std::span(groups).first(length));
  return digit ? kNames[static_cast<std::size_t>(*digit)] : nullptr;
}

}  // namespace gesture
