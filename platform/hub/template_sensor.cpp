#include "template_sensor.h"

#include <warping.h>

#include <algorithm>
#include <cstddef>

namespace hub {
namespace {

constexpr std::int32_t kLevel = 121;
constexpr std::int32_t kTemplateNumber = 122;  // 0 or 1; the next property is the template
constexpr std::int32_t kTemplate = 123;

constexpr std::int16_t kBothClasses = 3;
constexpr std::size_t kTemplateSize = gesture::kPoints * gesture::kAxes;

// For the levels -1, 0 and 1. See docs/accuracy.md for what they accept.
constexpr std::array<std::uint32_t, 3> kLimits = {2'600, 3'000, 3'400};

gesture::Points pointsOf(std::span<const std::uint8_t> bytes) {
  constexpr char kForeign[] = "the template is not one that the hub enrolled";
  if (bytes.size() != kTemplateSize) throw Refused(kForeign);
  gesture::Points points{};
  for (std::size_t i = 0; i < kTemplateSize; ++i) {
    const auto value = static_cast<std::int8_t>(bytes[i]);
    if (value < -gesture::kMostValue || value > gesture::kMostValue) throw Refused(kForeign);
    points[i / gesture::kAxes][i % gesture::kAxes] = value;
  }
  return points;
}

}  // namespace

void TemplateSensor::configure(Properties properties) {
  std::array<std::optional<gesture::Points>, 2> given;
  std::size_t number = 0;
  for (const Property& property : properties) {
    if (property.id == kTemplateNumber) number = property.integer() == 0 ? 0 : 1;
    if (property.id == kTemplate) given[number] = pointsOf(property.value);
  }
  templates = given;
  isEnrolling = properties.empty();
  limit = kLimits[static_cast<std::size_t>(std::clamp(integerOf(properties, kLevel, 0), -1, 1) + 1)];
}

void TemplateSensor::take(const Sample& sample, Records& records) {
  use(finder.take(sample), sample.time, records);
}

void TemplateSensor::finish(std::int64_t time, Records& records) {
  use(finder.finish(), time, records);
}

void TemplateSensor::use(const Movement& movement, std::int64_t time, Records& records) const {
  const auto drawing = gesture::describe(movement);
  if (!drawing) return;
  if (!isEnrolling) {
    const int nearest = nearestTemplate(drawing->points);
    if (nearest >= 0) records.emplace_back(kName, time).append(static_cast<std::int16_t>(1 << nearest));
    return;
  }
  Record& record = records.emplace_back(kName, time);
  record.append(kBothClasses);
  record.append(static_cast<std::uint8_t>(kTemplateSize >> 8));
  record.append(static_cast<std::uint8_t>(kTemplateSize));
  for (const gesture::Point& point : drawing->points) record.append(point);
}

// 0 or 1; -1 if none is near enough.
int TemplateSensor::nearestTemplate(const gesture::Points& points) const {
  int nearest = -1;
  std::uint32_t most = limit;
  for (std::size_t i = 0; i < templates.size(); ++i) {
    if (!templates[i]) continue;
    const std::uint32_t distance = gesture::warpingDistance(points, *templates[i], most);
    if (distance > most || (nearest >= 0 && distance == most)) continue;
    nearest = static_cast<int>(i);
    most = distance;
  }
  return nearest;
}

}  // namespace hub
