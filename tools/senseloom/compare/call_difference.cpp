#include "compare/call_difference.h"

#include <algorithm>
#include <cstdlib>
#include <memory>
#include <optional>
#include <span>
#include <utility>

#include "kinds/option_data.h"
#include "terminal/text_table.h"
#include "trace/hex.h"
#include "trace/property_text.h"
#include "trace/record_codec.h"

namespace senseloom::tool {
namespace {

constexpr char kNone[] = "none";

std::string jsonText(const json_t* json) {
  struct Free {
    void operator()(char* text) const { std::free(text); }
  };
  if (json == nullptr) return kNone;
  if (json_is_string(json)) return json_string_value(json);
  const std::unique_ptr<char, Free> text(json_dumps(json, JSON_COMPACT | JSON_ENCODE_ANY));
  return text == nullptr ? kNone : text.get();
}

void compare(Differences& differences, const std::string& what, const std::string& left, const std::string& right) {
  if (left != right) differences.push_back({what, left, right});
}

void compareMember(Differences& differences, const char* key, const json_t* left, const json_t* right) {
  compare(differences, key, jsonText(json_object_get(left, key)), jsonText(json_object_get(right, key)));
}

// The properties of a list, with their names and values; of what is not such a list, the text.
std::vector<std::pair<std::string, std::string>> propertyTexts(const Sensor* sensor, const json_t* list) {
  std::vector<std::pair<std::string, std::string>> texts;
  for (size_t i = 0; i < json_array_size(list); ++i) {
    const json_t* entry = json_array_get(list, i);
    const auto id = static_cast<int32_t>(json_integer_value(json_object_get(entry, member::kId)));
    const char* digits = json_string_value(json_object_get(entry, member::kValue));
    auto bytes = fromHex(digits == nullptr ? "" : digits);
    const bool isKnown = sensor != nullptr && bytes;
    const Property property{id, bytes.value_or(std::vector<uint8_t>()), isKnown && id == sensor->bytesProperty};
    texts.emplace_back(std::to_string(id) + (isKnown ? std::string(" ") + propertyName(sensor->name, id) : ""),
                       isKnown ? valueText(*sensor, property) : jsonText(entry));
  }
  return texts;
}

void compareProperties(Differences& differences, const Sensor* sensor, const json_t* left, const json_t* right) {
  if ((left == nullptr) != (right == nullptr)) {
    const auto text = [](const json_t* list) {
      return list == nullptr ? kNone : std::to_string(json_array_size(list)) + " properties";
    };
    differences.push_back({"property list", text(left), text(right)});
    return;
  }
  const auto lefts = propertyTexts(sensor, left);
  const auto rights = propertyTexts(sensor, right);
  for (size_t i = 0; i < std::max(lefts.size(), rights.size()); ++i) {
    const std::string leftText = i < lefts.size() ? lefts[i].second : kNone;
    const std::string rightText = i < rights.size() ? rights[i].second : kNone;
    const std::string& name = i < lefts.size() ? lefts[i].first : rights[i].first;
    if (i < lefts.size() && i < rights.size() && lefts[i].first != rights[i].first) {
      differences.push_back({"property " + std::to_string(i + 1), lefts[i].first + " = " + leftText,
                             rights[i].first + " = " + rightText});
    } else {
      compare(differences, name, leftText, rightText);
    }
  }
}

void compareArrays(Differences& differences, const std::string& name, const json_t* left, const json_t* right) {
  for (size_t i = 0; i < std::max(json_array_size(left), json_array_size(right)); ++i) {
    compare(differences, name + '[' + std::to_string(i) + ']', jsonText(json_array_get(left, i)),
            jsonText(json_array_get(right, i)));
  }
}

using Bytes = std::optional<std::vector<uint8_t>>;
using Decode = Json(const Sensor& sensor, std::span<const uint8_t> bytes);

std::string hexText(const std::vector<uint8_t>& bytes) {
  return bytes.empty() ? "no bytes" : toHex(bytes);
}

// Compares records or results field by field, or as bytes where they have no such fields.
void compareBytes(Differences& differences, const Sensor* sensor, Decode* decode, const char* what, const Bytes& left,
                  const Bytes& right) {
  if (left == right) return;
  const size_t before = differences.size();
  const Json leftFields = sensor != nullptr && left ? decode(*sensor, *left) : nullptr;
  const Json rightFields = sensor != nullptr && right ? decode(*sensor, *right) : nullptr;
  if (leftFields != nullptr && rightFields != nullptr) {
    const char* key;
    json_t* value;
    json_object_foreach(leftFields.get(), key, value) {
      if (json_is_array(value)) {
        compareArrays(differences, key, value, json_object_get(rightFields.get(), key));
      } else {
        compareMember(differences, key, leftFields.get(), rightFields.get());
      }
    }
  }
  if (differences.size() > before) return;
  const auto text = [](const Bytes& bytes, const Json& fields) {
    if (!bytes) return std::string(kNone);
    return fields != nullptr ? jsonText(fields.get()) : hexText(*bytes);
  };
  const bool areAlike = text(left, leftFields) == text(right, rightFields);  // but for what the fields do not show
  differences.push_back({what, areAlike ? hexText(*left) : text(left, leftFields),
                         areAlike ? hexText(*right) : text(right, rightFields)});
}

Bytes resultBytes(const json_t* outcome) {
  const char* digits = json_string_value(json_object_get(json_object_get(outcome, member::kResult), member::kHex));
  return digits == nullptr ? std::nullopt : fromHex(digits);
}

// For a cell of a table.
std::string shortened(const std::string& text) {
  constexpr size_t kMost = 60;
  return text.size() <= kMost ? text : text.substr(0, kMost) + "...";
}

}  // namespace

Differences outcomeDifferences(const Sensor* sensor, const json_t* left, const json_t* right) {
  Differences differences;
  compareMember(differences, member::kReturned, left, right);
  compareProperties(differences, sensor, json_object_get(left, member::kProperties),
                    json_object_get(right, member::kProperties));
  compareBytes(differences, sensor, decodeResult, member::kResult, resultBytes(left), resultBytes(right));
  return differences;
}

Differences callDifferences(const Sensor* sensor, const TraceCall& left, const TraceCall& right) {
  Differences differences;
  compare(differences, member::kCall, callName(left.kind), callName(right.kind));
  if (!differences.empty()) return differences;
  const auto sensorName = [](const TraceCall& call) { return call.sensor == nullptr ? kNone : call.sensor->name; };
  compare(differences, member::kSensor, sensorName(left), sensorName(right));
  compare(differences, member::kOption, left.option.value_or(kNone), right.option.value_or(kNone));
  const auto record = [sensor](const TraceCall& call) -> Bytes {
    if (call.record == nullptr || sensor == nullptr) return std::nullopt;
    return encodeRecord(*sensor, call.record.get());
  };
  compareBytes(differences, sensor, decodeRecord, member::kRecord, record(left), record(right));
  if (left.engine && right.engine) {
    compare(differences, "gesture engine", answersText(*left.engine), answersText(*right.engine));
  }
  if (left.recorded == nullptr || right.recorded == nullptr) return differences;
  const Differences outcomes = outcomeDifferences(sensor, left.recorded.get(), right.recorded.get());
  differences.insert(differences.end(), outcomes.begin(), outcomes.end());
  return differences;
}

void printDifferences(std::FILE* out, const char* left, const char* right, const Differences& differences) {
  std::vector<TextRow> rows{{"what", left, right}};
  for (const Difference& one : differences) rows.push_back({one.what, shortened(one.left), shortened(one.right)});
  printTable(out, rows);
}

Json differencesJson(const char* left, const char* right, const Differences& differences) {
  Json array(json_array());
  for (const Difference& one : differences) {
    Json object(json_object());
    addMember(object, "what", Json(json_string(one.what.c_str())));
    addMember(object, left, Json(json_string(one.left.c_str())));
    addMember(object, right, Json(json_string(one.right.c_str())));
    json_array_append_new(array.get(), object.release());
  }
  return array;
}

}  // namespace senseloom::tool
