#include "trace/record_codec.h"

#include <limits>
#include <optional>
#include <string>
#include <utility>

#include "input_error.h"
#include "trace/field_check.h"
#include "trace/hex.h"
#include "trace/item_codec.h"
#include "trace/record_field.h"
#include "trace/record_value.h"
#include "trace/trace_form.h"

namespace senseloom::tool {
namespace {

std::vector<uint8_t> encodeHex(json_t* record) {
  checkFields(record, {member::kHex});
  const json_t* digits = json_object_get(record, member::kHex);
  auto bytes = json_is_string(digits) ? fromHex(json_string_value(digits)) : std::nullopt;
  if (!bytes) throw InputError(quotedField(member::kHex) + " must be a string of hexadecimal digits, two a byte");
  return *std::move(bytes);
}

void encodeValue(const Sensor& sensor, const json_t* value, std::vector<uint8_t>& bytes) {
  if (sensor.valueSize == sizeof(int32_t)) {
    setRecordField(bytes, kValueOffset, integerField<int32_t>(value, sensor.value));
  } else {
    setRecordField(bytes, kValueOffset, integerField<int16_t>(value, sensor.value));
  }
}

// Appends the items behind the head that `bytes` holds, and sets their number or their length at the end of the head.
void encodeItems(const ItemCodec& items, bool areCounted, json_t* array, std::vector<uint8_t>& bytes) {
  const size_t count = json_array_size(array);
  if (!json_is_array(array) || count > items.most) {
    throw InputError(quotedField(items.field) + " must be an array of at most " + std::to_string(items.most));
  }
  const size_t head = bytes.size();
  bytes.resize(head + count * items.size);
  setRecordField(bytes, head - sizeof(uint16_t), static_cast<uint16_t>(areCounted ? count : count * items.size));
  for (size_t i = 0; i < count; ++i) items.encode(json_array_get(array, i), bytes.data() + head + i * items.size);
}

// A JSON integer ends at 2^63 - 1, so a greater timestamp, which only raw bytes can bring in, becomes its digits.
Json decodeTimestamp(uint64_t timestamp) {
  if (timestamp > uint64_t{std::numeric_limits<int64_t>::max()}) {
    return Json(json_string(std::to_string(timestamp).c_str()));
  }
  return Json(json_integer(static_cast<json_int_t>(timestamp)));
}

// Null when there are not so many.
Json decodeItems(const ItemCodec& items, int32_t count, std::span<const uint8_t> bytes) {
  if (count < 0 || static_cast<size_t>(count) > bytes.size() / items.size) return nullptr;
  Json array(json_array());
  for (size_t i = 0; i < static_cast<size_t>(count); ++i) {
    json_array_append_new(array.get(), items.decode(bytes.data() + i * items.size).release());
  }
  return array;
}

// The timestamp, and the integer behind it if it has a name; null when the bytes end before.
Json decodeHead(const Sensor& sensor, std::span<const uint8_t> record, const char* valueName) {
  if (record.size() < kValueOffset + sensor.valueSize) return nullptr;
  Json fields(json_object());
  addMember(fields, member::kTimestamp, decodeTimestamp(*recordField<uint64_t>(record, kTimestampOffset)));
  if (valueName != nullptr) addMember(fields, valueName, Json(json_integer(*recordValue(sensor, record))));
  return fields;
}

}  // namespace

std::vector<uint8_t> encodeRecord(const Sensor& sensor, json_t* record) {
  if (json_object_get(record, member::kHex) != nullptr) return encodeHex(record);

  const ItemCodec* items = itemCodec(sensor.items);
  const char* itemsField = items == nullptr ? nullptr : items->field;
  checkFields(record, {member::kTimestamp, sensor.value, itemsField});

  const bool isNamed = sensor.value != nullptr;
  const size_t lengthSize = isNamed && items != nullptr ? sizeof(uint16_t) : 0;
  std::vector<uint8_t> bytes(kValueOffset + sensor.valueSize + lengthSize);
  setRecordField(bytes, kTimestampOffset,
                 integerField(json_object_get(record, member::kTimestamp), member::kTimestamp, 0,
                              std::numeric_limits<int64_t>::max()));
  if (isNamed) encodeValue(sensor, json_object_get(record, sensor.value), bytes);
  if (items != nullptr) encodeItems(*items, !isNamed, json_object_get(record, itemsField), bytes);
  return bytes;
}

Json decodeRecord(const Sensor& sensor, std::span<const uint8_t> record) {
  const ItemCodec* items = itemCodec(sensor.items);
  Json fields = decodeHead(sensor, record, sensor.value);
  if (fields == nullptr || items == nullptr) return fields;
  const size_t lengthOffset = kValueOffset + (sensor.value == nullptr ? 0 : sensor.valueSize);
  const auto counted = recordField<uint16_t>(record, lengthOffset);
  if (!counted) return nullptr;
  const int32_t count =
      sensor.value == nullptr ? static_cast<int16_t>(*counted) : *counted / static_cast<int32_t>(items->size);
  Json array = decodeItems(*items, count, record.subspan(lengthOffset + sizeof(uint16_t)));
  if (array == nullptr) return nullptr;
  addMember(fields, items->field, std::move(array));
  return fields;
}

Json decodeResult(const Sensor& sensor, std::span<const uint8_t> result) {
  if (sensor.resultValue != nullptr) return decodeHead(sensor, result, sensor.resultValue);
  return decodeRecord(sensor, result);
}

}  // namespace senseloom::tool
