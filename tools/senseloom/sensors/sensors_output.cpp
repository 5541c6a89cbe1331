#include "sensors/sensors_output.h"

#include <utility>
#include <vector>

#include "kinds/option_data.h"
#include "kinds/sensor_table.h"
#include "terminal/text_table.h"
#include "trace/json.h"

namespace senseloom::tool {
namespace {

std::vector<const OptionDescription*> select(const std::string& sensor) {
  if (sensor.empty()) return {optionDescriptions().begin(), optionDescriptions().end()};
  return {findOptionDescription(sensorNamed(sensor).name)};
}

std::string outOfRangeText(const OptionKey& key) {
  if (rangeText(key.range) == "any") return "";
  switch (key.outOfRange) {
    case OutOfRange::replaced:
      return "becomes " + std::to_string(key.fallback);
    case OutOfRange::clamped:
      return "nearest bound";
    case OutOfRange::kept:
      return "see note";
  }
  return "";
}

const char* orEmpty(const char* text) {
  return text == nullptr ? "" : text;
}

void printSensor(std::FILE* out, const OptionDescription& kind) {
  std::fprintf(out, "%s: %s\n", kind.sensor, kind.title);

  std::vector<TextRow> rows{{"key", "default", "range", "out of range", "merged to", "note"}};
  for (const OptionKey& key : kind.keys) {
    rows.push_back({key.name, std::to_string(key.defaultValue), rangeText(key.range), outOfRangeText(key),
                    mergeText(key.merge), orEmpty(key.note)});
  }
  for (const char* key : kind.stringKeys) rows.push_back({key, "", "string", "", "", ""});
  printTable(out, rows);

  std::string properties;
  for (const OptionProperty& property : kind.properties) {
    properties += (properties.empty() ? "" : ", ") + std::to_string(property.id) + ' ' + property.name;
  }
  std::fprintf(out, "  properties: %s\n", properties.empty() ? "none" : properties.c_str());
  if (kind.note != nullptr) std::fprintf(out, "  note: %s\n", kind.note);
}

Json text(const char* value) {
  return Json(json_string(value));
}
Json integer(int32_t value) {
  return Json(json_integer(value));
}

Json keyJson(const OptionKey& key) {
  Json object(json_object());
  addMember(object, "name", text(key.name));
  addMember(object, "default", integer(key.defaultValue));
  Json range(json_array());
  if (key.range.low <= key.range.high) {
    json_array_append_new(range.get(), json_integer(key.range.low));
    json_array_append_new(range.get(), json_integer(key.range.high));
  }
  addMember(object, "range", std::move(range));  // empty: no value is in range
  addMember(object, "outOfRange", text(outOfRangeText(key).c_str()));
  addMember(object, "merged", text(mergeText(key.merge)));
  addMember(object, "note", text(orEmpty(key.note)));
  return object;
}

Json sensorJson(const OptionDescription& kind) {
  Json object(json_object());
  addMember(object, "sensor", text(kind.sensor));
  addMember(object, "title", text(kind.title));
  Json keys(json_array());
  for (const OptionKey& key : kind.keys) json_array_append_new(keys.get(), keyJson(key).release());
  addMember(object, "keys", std::move(keys));
  Json stringKeys(json_array());
  for (const char* key : kind.stringKeys) json_array_append_new(stringKeys.get(), json_string(key));
  addMember(object, "stringKeys", std::move(stringKeys));
  Json properties(json_array());
  for (const OptionProperty& property : kind.properties) {
    Json entry(json_object());
    addMember(entry, "id", integer(property.id));
    addMember(entry, "name", text(property.name));
    json_array_append_new(properties.get(), entry.release());
  }
  addMember(object, "properties", std::move(properties));
  addMember(object, "note", text(orEmpty(kind.note)));
  return object;
}

}  // namespace

void printSensors(std::FILE* out, const std::string& sensor) {
  const char* separator = "";
  for (const OptionDescription* kind : select(sensor)) {
    std::fputs(separator, out);
    printSensor(out, *kind);
    separator = "\n";
  }
}

void printSensorsJson(std::FILE* out, const std::string& sensor) {
  for (const OptionDescription* kind : select(sensor)) {
    std::fprintf(out, "%s\n", compactText(sensorJson(*kind).get()).c_str());
  }
}

}  // namespace senseloom::tool
