#pragma once

#include <cstdint>
#include <span>
#include <vector>

#include "kinds/sensor_table.h"
#include "trace/json.h"

// Records and results in traces and in output: their bytes from their fields, and back.
namespace senseloom::tool {

// The bytes of the "record" of a trace: {"hex":"..."}, or the sensor's fields. Throws InputError.
std::vector<uint8_t> encodeRecord(const Sensor& sensor, json_t* record);

// The fields of a record, or of a result; null when it does not hold the bytes that it should. Bytes beyond are
// ignored.
Json decodeRecord(const Sensor& sensor, std::span<const uint8_t> record);
Json decodeResult(const Sensor& sensor, std::span<const uint8_t> result);

}  // namespace senseloom::tool
