#include "trace/record_codec.h"

#include <algorithm>
#include <cstring>
#include <initializer_list>
#include <limits>
#include <optional>
#include <string>
#include <utility>

#include "trace/hex.h"
#include "input_error.h"

namespace senseloom::tool {
namespace {

constexpr size_t kValueOffset = 8;
constexpr size_t kSampleAxes = 6;
constexpr size_t kOpaqueItemSize = 28;
constexpr size_t kMostItems = std::numeric_limits<int16_t>::max();

template <class Integer>
Integer load(const uint8_t* bytes) {
  Integer value;
  std::memcpy(&value, bytes, sizeof value);
  return value;
}

template <class Integer>
void store(uint8_t* bytes, Integer value) {
  std::memcpy(bytes, &value, sizeof value);
}

std::string quoted(std::string_view field) {
  return "record field \"" + std::string(field) + '"';
}

int64_t integerOf(const json_t* value, std::string_view field, int64_t low, int64_t high) {
  if (!json_is_integer(value) || json_integer_value(value) < low || json_integer_value(value) > high) {
    throw InputError(quoted(field) + " must be an integer from " + std::to_string(low) + " to " + std::to_string(high));
  }
  return json_integer_value(value);
}

template <class Integer>
Integer integerOf(const json_t* value, std::string_view field) {
  using Limits = std::numeric_limits<Integer>;
  return static_cast<Integer>(integerOf(value, field, Limits::min(), Limits::max()));
}

// An object of a trace is to have these fields and no others.
void checkFields(json_t* object, std::initializer_list<const char*> fields) {
  const char* key;
  json_t* value;
  json_object_foreach(object, key, value) {
    const auto isKey = [key](const char* field) { return field != nullptr && std::string_view(field) == key; };
    if (std::none_of(fields.begin(), fields.end(), isKey)) throw InputError("unknown " + quoted(key));
  }
  for (const char* field : fields) {
    if (field != nullptr && json_object_get(object, field) == nullptr) throw InputError("missing " + quoted(field));
  }
}

// A class record: the class id in the low 4 bits, a signed sequence number in the 12 above.
void encodeClassRecord(json_t* element, uint8_t* bytes) {
  if (!json_is_object(element)) throw InputError(quoted("items") + " must hold objects");
  checkFields(element, {"class", "seq"});
  const int64_t classId = integerOf(json_object_get(element, "class"), "class", 0, 15);
  const int64_t sequence = integerOf(json_object_get(element, "seq"), "seq", -2048, 2047);
  store(bytes, static_cast<int16_t>(sequence * 16 + classId));
}

Json decodeClassRecord(const uint8_t* bytes) {
  const auto item = load<int16_t>(bytes);
  Json element(json_object());
  addMember(element, "class", Json(json_integer(item & 15)));
  addMember(element, "seq", Json(json_integer(item >> 4)));
  return element;
}

void encodeSample(json_t* element, uint8_t* bytes) {
  if (!json_is_array(element) || json_array_size(element) != kSampleAxes) {
    throw InputError(quoted("samples") + " must hold arrays of six integers");
  }
  for (size_t axis = 0; axis < kSampleAxes; ++axis) {
    store(bytes + 2 * axis, integerOf<int16_t>(json_array_get(element, axis), "samples"));
  }
}

// What an item of dead reckoning means is known to its producer alone.
void encodeOpaqueItem(json_t* element, uint8_t* bytes) {
  const auto item = json_is_string(element) ? fromHex(json_string_value(element)) : std::nullopt;
  if (!item || item->size() != kOpaqueItemSize) {
    throw InputError(quoted("items") + " must hold strings of 56 hexadecimal digits");
  }
  std::copy(item->begin(), item->end(), bytes);
}

Json decodeOpaqueItem(const uint8_t* bytes) {
  return Json(json_string(toHex({bytes, kOpaqueItemSize}).c_str()));
}

constexpr RecordElements kClassRecords{"items", 2, kMostItems, encodeClassRecord, decodeClassRecord};
constexpr RecordElements kOpaqueItems{"items", kOpaqueItemSize, kMostItems, encodeOpaqueItem, decodeOpaqueItem};
// A client gave the samples itself, so a result does not repeat them.
constexpr RecordElements kSamples{"samples", 2 * kSampleAxes, std::numeric_limits<uint16_t>::max() / (2 * kSampleAxes),
                                  encodeSample, nullptr};

constexpr RecordLayout kLayouts[] = {
    {.sensor = "PHYAC", .elements = &kClassRecords},
    {.sensor = "STAP", .value = "classes"},
    {.sensor = "GSFLK", .value = "class"},
    {.sensor = "SHAKI", .value = "class"},
    {.sensor = "ISACT", .value = "class", .valueSize = 4},
    {.sensor = "SCOUN", .value = "steps", .valueSize = 4},
    {.sensor = "GSPX", .value = "prx", .elements = &kSamples, .resultValue = "class"},
    {.sensor = "DTWGS", .value = "classes"},
    {.sensor = "GSETH", .value = "class"},
    {.sensor = "LPE_P", .value = "class"},
    {.sensor = "PDR", .elements = &kOpaqueItems},
    {.sensor = "LIFT", .value = "class"},
};

std::vector<uint8_t> encodeHex(json_t* record) {
  checkFields(record, {"hex"});
  const json_t* digits = json_object_get(record, "hex");
  auto bytes = json_is_string(digits) ? fromHex(json_string_value(digits)) : std::nullopt;
  if (!bytes) throw InputError(quoted("hex") + " must be a string of hexadecimal digits, two a byte");
  return *std::move(bytes);
}

// Appends the elements behind the head that `bytes` holds, and notes their number or length there.
void encodeElements(const RecordLayout& layout, json_t* array, std::vector<uint8_t>& bytes) {
  const RecordElements& elements = *layout.elements;
  const size_t count = json_array_size(array);
  if (!json_is_array(array) || count > elements.most) {
    throw InputError(quoted(elements.field) + " must be an array of at most " + std::to_string(elements.most));
  }
  const size_t head = bytes.size();
  bytes.resize(head + count * elements.size);
  store(bytes.data() + head - 2, static_cast<uint16_t>(layout.value == nullptr ? count : count * elements.size));
  for (size_t i = 0; i < count; ++i) {
    elements.encode(json_array_get(array, i), bytes.data() + head + i * elements.size);
  }
}

// A JSON integer ends at 2^63 - 1, so a greater timestamp, which only raw bytes can bring in, becomes its digits.
Json decodeTimestamp(uint64_t timestamp) {
  if (timestamp > uint64_t{std::numeric_limits<int64_t>::max()}) {
    return Json(json_string(std::to_string(timestamp).c_str()));
  }
  return Json(json_integer(static_cast<json_int_t>(timestamp)));
}

}  // namespace

std::span<const RecordLayout> recordLayouts() {
  return kLayouts;
}

const RecordLayout* findRecordLayout(std::string_view sensor) {
  const auto* found = std::find_if(std::begin(kLayouts), std::end(kLayouts),
                                   [sensor](const RecordLayout& layout) { return layout.sensor == sensor; });
  return found == std::end(kLayouts) ? nullptr : found;
}

std::vector<uint8_t> encodeRecord(const RecordLayout& layout, json_t* record) {
  if (json_object_get(record, "hex") != nullptr) return encodeHex(record);

  const char* elementsField = layout.elements == nullptr ? nullptr : layout.elements->field;
  checkFields(record, {"timestamp", layout.value, elementsField});

  const size_t lengthField = layout.elements == nullptr ? 0 : 2;
  std::vector<uint8_t> bytes(kValueOffset + (layout.value == nullptr ? 0 : layout.valueSize) + lengthField);
  store(bytes.data(),
        integerOf(json_object_get(record, "timestamp"), "timestamp", 0, std::numeric_limits<int64_t>::max()));
  if (layout.value != nullptr) {
    const json_t* value = json_object_get(record, layout.value);
    if (layout.valueSize == 4) {
      store(bytes.data() + kValueOffset, integerOf<int32_t>(value, layout.value));
    } else {
      store(bytes.data() + kValueOffset, integerOf<int16_t>(value, layout.value));
    }
  }
  if (layout.elements != nullptr) encodeElements(layout, json_object_get(record, elementsField), bytes);
  return bytes;
}

Json decodeResult(const RecordLayout& layout, std::span<const uint8_t> result) {
  if (result.size() < kValueOffset + layout.valueSize) return nullptr;
  const uint8_t* atValue = result.data() + kValueOffset;
  const int32_t value = layout.valueSize == 4 ? load<int32_t>(atValue) : load<int16_t>(atValue);

  Json fields(json_object());
  addMember(fields, "timestamp", decodeTimestamp(load<uint64_t>(result.data())));
  if (layout.value != nullptr) {
    addMember(fields, layout.resultValue == nullptr ? layout.value : layout.resultValue, Json(json_integer(value)));
    return fields;
  }

  const RecordElements& elements = *layout.elements;
  const auto bytes = result.subspan(kValueOffset + layout.valueSize);
  if (value < 0 || static_cast<size_t>(value) > bytes.size() / elements.size) return nullptr;
  Json array(json_array());
  for (size_t i = 0; i < static_cast<size_t>(value); ++i) {
    json_array_append_new(array.get(), elements.decode(bytes.data() + i * elements.size).release());
  }
  addMember(fields, elements.field, std::move(array));
  return fields;
}

}  // namespace senseloom::tool
