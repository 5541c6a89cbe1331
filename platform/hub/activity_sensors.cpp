#include "activity_sensors.h"

#include <algorithm>

namespace hub {
namespace {

// Properties of "PHYAC": in the low 16 bits the least number of decisions that a client's batch spans, of those 0.32 s
// apart; and how many decisions are to be reported in that time.
constexpr std::int32_t kSpans = 43;
constexpr std::int32_t kDecisionsPerSpan = 44;

constexpr std::int32_t kInstantClassMask = 151;
constexpr std::int32_t kAllInstantClasses = 15;

}  // namespace

void ActivitySensor::configure(Properties properties) {
  const auto span = static_cast<std::uint32_t>(std::max(integerOf(properties, kSpans, 1) & 0xffff, 1));
  perRecord = static_cast<std::size_t>(std::clamp(integerOf(properties, kDecisionsPerSpan, 1), 1, 256));
  step = std::max(span / static_cast<std::uint32_t>(perRecord), 1U);
  items.clear();
  skipped = 0;
}

void ActivitySensor::take(const Sample& sample, Records& records) {
  const auto activity = classifier.take(sample.acceleration);
  if (!activity || ++skipped < step) return;
  skipped = 0;
  items.push_back(static_cast<std::uint16_t>(sequence++ << 4 | static_cast<std::uint32_t>(*activity)));
  if (items.size() < perRecord) return;
  Record& record = records.emplace_back(kName, sample.time);
  record.append(static_cast<std::int16_t>(items.size()));
  for (const std::uint16_t item : items) record.append(item);
  items.clear();
}

void InstantActivitySensor::configure(Properties properties) {
  classMask = integerOf(properties, kInstantClassMask, kAllInstantClasses);
}

void InstantActivitySensor::take(const Sample& sample, Records& records) {
  const auto activity = classifier.take(sample.acceleration);
  if (!activity || *activity == Activity::unknown) return;
  const auto number = static_cast<std::int32_t>(*activity);
  if ((classMask >> (number - 1) & 1) == 0) return;
  records.emplace_back(kName, sample.time).append(number);
}

}  // namespace hub
