#include "plot/record_hues.h"

#include <algorithm>
#include <cstdlib>
#include <optional>

#include "trace/class_names.h"
#include "trace/record_value.h"

namespace senseloom::tool {
namespace {

RecordHues oneOf(size_t hue) {
  RecordHues hues{.records = 1};
  hues.counts[hue] = 1;
  return hues;
}

RecordHues ofClass(int32_t classNumber) {
  return oneOf(classNumber >= 0 && classNumber < static_cast<int32_t>(kOtherHue) ? static_cast<size_t>(classNumber)
                                                                                 : kOtherHue);
}

RecordHues ofDecisions(std::span<const uint8_t> record) {
  RecordHues hues{.records = 1};
  const auto count = recordField<int16_t>(record, kValueOffset).value_or(0);
  for (int i = 0; i < count; ++i) {
    const auto decision = recordField<uint16_t>(record, kItemsOffset + 2 * static_cast<size_t>(i));
    if (!decision) break;
    hues.add(ofClass(*decision & 15));
  }
  hues.records = 1;
  return hues;
}

RecordHues ofAmount(int64_t amount) {
  RecordHues hues = oneOf(kPlainHue);
  hues.height = static_cast<uint32_t>(std::abs(amount));
  return hues;
}

std::string classSetText(size_t set) {
  std::string text;
  for (size_t bit = 0; set >> bit != 0; ++bit) {
    if ((set >> bit & 1) != 0) text += (text.empty() ? "class " : " + ") + std::to_string(bit + 1);
  }
  return text.empty() ? "no class" : text;
}

}  // namespace

void RecordHues::add(const RecordHues& other) {
  for (size_t hue = 0; hue < kHues; ++hue) counts[hue] += other.counts[hue];
  height = std::max(height, other.height);
  records += other.records;
}

RecordHues huesOf(const Sensor& sensor, std::span<const uint8_t> record, bool isResult) {
  if (sensor.items == Items::decisions) return ofDecisions(record);
  const auto value = recordValue(sensor, record);
  if (sensor.shown == Shown::amount) return ofAmount(value.value_or(0));
  // What a record has in the place of its result's class is not a class.
  if (!value || (sensor.resultValue != nullptr && !isResult)) return oneOf(kPlainHue);
  return ofClass(*value);
}

std::string hueText(const Sensor& sensor, size_t hue, const std::vector<std::string>& names) {
  if (hue == kPlainHue && sensor.shown == Shown::amount) return sensor.value == nullptr ? "items" : sensor.value;
  if (hue == kPlainHue) return "no class";
  if (hue == kOtherHue) return "other class";
  if (sensor.shown == Shown::classSet) return classSetText(hue);
  if (const std::string name = className(sensor, names, static_cast<int64_t>(hue)); !name.empty()) return name;
  const std::string text = "class " + std::to_string(hue);
  return static_cast<int32_t>(hue) == sensor.noMajorityClass ? text + " (no majority)" : text;
}

}  // namespace senseloom::tool
