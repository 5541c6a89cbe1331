#include "plot/record_hues.h"

#include <algorithm>
#include <cstdlib>
#include <iterator>

#include "trace/record_field.h"

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

// A record that is too short for its class shows none.
template <class Number>
RecordHues lookAtNumber(std::span<const uint8_t> record, bool) {
  const auto number = recordField<Number>(record, kValueOffset);
  return number ? ofClass(*number) : oneOf(kPlainHue);
}

RecordHues lookAtItems(std::span<const uint8_t> record, bool) {
  RecordHues hues{.records = 1};
  const auto count = recordField<int16_t>(record, kValueOffset).value_or(0);
  for (int i = 0; i < count; ++i) {
    const auto item = recordField<uint16_t>(record, kElementsOffset + 2 * static_cast<size_t>(i));
    if (!item) break;
    hues.add(ofClass(*item & 15));
  }
  hues.records = 1;
  return hues;
}

// The record of a drawn gesture holds samples, its result the class.
RecordHues lookAtGesture(std::span<const uint8_t> record, bool isResult) {
  return isResult ? lookAtNumber<int16_t>(record, isResult) : oneOf(kPlainHue);
}

template <class Number>
RecordHues lookAtHeight(std::span<const uint8_t> record, bool) {
  RecordHues hues = oneOf(kPlainHue);
  const int64_t number = recordField<Number>(record, kValueOffset).value_or(0);
  hues.height = static_cast<uint32_t>(std::abs(number));
  return hues;
}

constexpr RecordLook kLooks[] = {
    {.sensor = "PHYAC", .look = lookAtItems, .lasts = true},
    {.sensor = "STAP", .look = lookAtNumber<int16_t>, .isClassSet = true},
    {.sensor = "GSFLK", .look = lookAtNumber<int16_t>},
    {.sensor = "SHAKI", .look = lookAtNumber<int16_t>},
    {.sensor = "ISACT", .look = lookAtNumber<int32_t>, .lasts = true},
    {.sensor = "SCOUN", .look = lookAtHeight<int32_t>, .hasHeight = true},
    {.sensor = "GSPX", .look = lookAtGesture},
    {.sensor = "DTWGS", .look = lookAtNumber<int16_t>, .isClassSet = true},
    {.sensor = "GSETH", .look = lookAtNumber<int16_t>},
    {.sensor = "LPE_P", .look = lookAtNumber<int16_t>, .lasts = true},
    {.sensor = "PDR", .look = lookAtHeight<int16_t>, .hasHeight = true},
    {.sensor = "LIFT", .look = lookAtNumber<int16_t>},
};

std::string classSetText(size_t set) {
  std::string text;
  for (size_t bit = 0; bit < 3; ++bit) {
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

const RecordLook& recordLookOf(const RecordLayout& sensor) {
  return *std::find_if(std::begin(kLooks), std::end(kLooks),
                       [&sensor](const RecordLook& look) { return look.sensor == sensor.sensor; });
}

std::string hueText(const RecordLook& look, size_t hue, const std::vector<std::string>& names) {
  if (hue == kPlainHue) return look.sensor == "SCOUN" ? "steps" : look.sensor == "PDR" ? "items" : "no class";
  if (hue == kOtherHue) return "other class";
  if (look.isClassSet) return classSetText(hue);
  if (hue < names.size()) return names[hue];
  // The one class that the library itself makes.
  if (hue == 6 && look.sensor == "PHYAC") return "class 6 (no majority)";
  return "class " + std::to_string(hue);
}

}  // namespace senseloom::tool
