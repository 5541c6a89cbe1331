#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>
#include <vector>

#include "trace/json.h"

namespace senseloom::tool {

// The elements behind the head of a record, all of one size.
struct RecordElements {
  const char* field;  // the array that holds them in a trace
  size_t size;        // bytes of one element
  size_t most;        // elements that a record can count
  void (*encode)(json_t* element, uint8_t* bytes);
  Json (*decode)(const uint8_t* bytes);
};

// How the records of one sensor are laid out. All begin with a 64-bit timestamp.
struct RecordLayout {
  const char* sensor;
  // The signed integer at byte 8. Null: the number of elements stands there, and they follow at byte 10. With both a
  // value and elements, the length of the elements in bytes stands at byte 10, and they follow at byte 12.
  const char* value = nullptr;
  size_t valueSize = 2;
  const RecordElements* elements = nullptr;
  // A result shows the integer at byte 8 under this name, and no elements, when it is not what the record has there.
  const char* resultValue = nullptr;
};

// One layout a sensor.
std::span<const RecordLayout> recordLayouts();
// Null when there is no such sensor.
const RecordLayout* findRecordLayout(std::string_view sensor);

// The bytes of the "record" of a trace: {"hex":"..."}, or the sensor's fields. Throws InputError.
std::vector<uint8_t> encodeRecord(const RecordLayout& layout, json_t* record);

// The fields of a result; null when it does not hold the bytes that it should. Bytes beyond are ignored.
Json decodeResult(const RecordLayout& layout, std::span<const uint8_t> result);

}  // namespace senseloom::tool
