#pragma once

#include <cstdint>
#include <optional>
#include <span>

#include "kinds/sensor_table.h"
#include "trace/record_field.h"

namespace senseloom::tool {

// The integer in the head of a record; nothing when the record is too short for it.
inline std::optional<int32_t> recordValue(const Sensor& sensor, std::span<const uint8_t> record) {
  if (sensor.valueSize == sizeof(int32_t)) return recordField<int32_t>(record, kValueOffset);
  return recordField<int16_t>(record, kValueOffset);
}

}  // namespace senseloom::tool
