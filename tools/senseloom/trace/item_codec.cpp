#include "trace/item_codec.h"

#include <algorithm>
#include <limits>
#include <span>

#include "input_error.h"
#include "trace/field_check.h"
#include "trace/hex.h"
#include "trace/record_field.h"
#include "trace/trace_form.h"

namespace senseloom::tool {
namespace {

constexpr size_t kDecisionSize = 2;
constexpr size_t kSampleAxes = 6;
constexpr size_t kSampleSize = kSampleAxes * sizeof(int16_t);
constexpr size_t kOpaqueSize = 28;

void encodeDecision(json_t* element, uint8_t* bytes) {
  if (!json_is_object(element)) throw InputError(quotedField(member::kItems) + " must hold objects");
  checkFields(element, {member::kClass, member::kSequence});
  const int64_t classId = integerField(json_object_get(element, member::kClass), member::kClass, 0, 15);
  const int64_t sequence = integerField(json_object_get(element, member::kSequence), member::kSequence, -2048, 2047);
  setRecordField({bytes, kDecisionSize}, 0, static_cast<int16_t>(sequence * 16 + classId));
}

Json decodeDecision(const uint8_t* bytes) {
  const int16_t decision = *recordField<int16_t>({bytes, kDecisionSize}, 0);
  Json element(json_object());
  addMember(element, member::kClass, Json(json_integer(decision & 15)));
  addMember(element, member::kSequence, Json(json_integer(decision >> 4)));
  return element;
}

void encodeSample(json_t* element, uint8_t* bytes) {
  if (!json_is_array(element) || json_array_size(element) != kSampleAxes) {
    throw InputError(quotedField(member::kSamples) + " must hold arrays of six integers");
  }
  for (size_t axis = 0; axis < kSampleAxes; ++axis) {
    const auto value = integerField<int16_t>(json_array_get(element, axis), member::kSamples);
    setRecordField({bytes, kSampleSize}, axis * sizeof value, value);
  }
}

Json decodeSample(const uint8_t* bytes) {
  Json element(json_array());
  for (size_t axis = 0; axis < kSampleAxes; ++axis) {
    const auto value = *recordField<int16_t>({bytes, kSampleSize}, axis * sizeof(int16_t));
    json_array_append_new(element.get(), json_integer(value));
  }
  return element;
}

void encodeOpaque(json_t* element, uint8_t* bytes) {
  const auto item = json_is_string(element) ? fromHex(json_string_value(element)) : std::nullopt;
  if (!item || item->size() != kOpaqueSize) {
    throw InputError(quotedField(member::kItems) + " must hold strings of 56 hexadecimal digits");
  }
  std::copy(item->begin(), item->end(), bytes);
}

Json decodeOpaque(const uint8_t* bytes) {
  return Json(json_string(toHex({bytes, kOpaqueSize}).c_str()));
}

constexpr size_t kMostCounted = std::numeric_limits<int16_t>::max();
constexpr ItemCodec kDecisions{member::kItems, kDecisionSize, kMostCounted, encodeDecision, decodeDecision};
constexpr ItemCodec kOpaque{member::kItems, kOpaqueSize, kMostCounted, encodeOpaque, decodeOpaque};
constexpr ItemCodec kSamples{member::kSamples, kSampleSize, std::numeric_limits<uint16_t>::max() / kSampleSize,
                             encodeSample, decodeSample};

}  // namespace

const ItemCodec* itemCodec(Items items) {
  switch (items) {
    case Items::decisions:
      return &kDecisions;
    case Items::samples:
      return &kSamples;
    case Items::opaque:
      return &kOpaque;
    case Items::none:
      break;
  }
  return nullptr;
}

}  // namespace senseloom::tool
