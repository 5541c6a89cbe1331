#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <span>
#include <string>
#include <vector>

#include "kinds/sensor_table.h"

namespace senseloom::tool {

// What has a colour of its own in a picture: each of the classes 0 to 16, or each set of the first four classes; all
// other classes together; and records that show no class.
inline constexpr size_t kHues = 19;
inline constexpr size_t kOtherHue = 17;
inline constexpr size_t kPlainHue = 18;

// What a picture shows of one or more records.
struct RecordHues {
  std::array<uint32_t, kHues> counts{};  // by hue; where a record has decisions, of these
  uint32_t height = 0;                   // the greatest number of steps, or of items
  uint32_t records = 0;

  void add(const RecordHues& other);
};

// What a picture shows of one record of a sensor, or of one result.
RecordHues huesOf(const Sensor& sensor, std::span<const uint8_t> record, bool isResult);

// The meaning of a hue. `names` are the names of the classes from 0 on, as far as they have any.
std::string hueText(const Sensor& sensor, size_t hue, const std::vector<std::string>& names);

}  // namespace senseloom::tool
