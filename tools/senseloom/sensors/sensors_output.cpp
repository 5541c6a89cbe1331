#include "sensors/sensors_output.h"

#include <utility>
#include <vector>

#include "kinds/option_data.h"
#include "kinds/sensor_table.h"
#include "model/kinds.h"
#include "terminal/text_table.h"
#include "trace/item_codec.h"
#include "trace/json.h"
#include "trace/trace_form.h"

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

// What the model's table says of a sensor, for people.
const model::KindRow& wordsOf(const OptionDescription& kind) {
  return model::rowOf(model::kindNamed(kind.sensor));
}

std::string propertyMeans(const model::PropertyRow& property) {
  return property.key == nullptr ? property.means : '"' + std::string(property.key) + "\", merged";
}

// The fields of the sensor's records, by name, with what they mean.
std::vector<TextRow> fieldsOf(const Sensor& sensor) {
  std::vector<TextRow> fields{{member::kTimestamp, kTimestampMeans}};
  if (sensor.value != nullptr) fields.push_back({sensor.value, sensor.valueMeans});
  if (const ItemCodec* items = itemCodec(sensor.items)) fields.push_back({items->field, sensor.itemsMean});
  if (sensor.resultValue != nullptr) fields.push_back({sensor.resultValue, sensor.resultValueMeans});
  return fields;
}

void printKeys(std::FILE* out, const OptionDescription& kind) {
  const model::KindRow& words = wordsOf(kind);
  std::vector<TextRow> rows{{"key", "default", "range", "out of range", "merged to", "means"}};
  for (size_t i = 0; i < kind.keys.size(); ++i) {
    const OptionKey& key = kind.keys[i];
    rows.push_back({key.name, std::to_string(key.defaultValue), rangeText(key.range), outOfRangeText(key),
                    mergeText(key.merge), words.keys.begin()[i].means});
  }
  for (const model::StringKey& key : words.stringKeys) rows.push_back({key.name, "", "string", "", "", key.means});
  printTable(out, rows);
  for (const OptionKey& key : kind.keys) {
    if (key.note != nullptr) std::fprintf(out, "  note on %s: %s\n", key.name, key.note);
  }
  if (kind.note != nullptr) std::fprintf(out, "  note: %s\n", kind.note);
}

void printSensor(std::FILE* out, const OptionDescription& kind) {
  std::fprintf(out, "%s: %s\n", kind.sensor, kind.title);
  printKeys(out, kind);
  std::vector<TextRow> rows{{"property", "means"}};
  for (const model::PropertyRow& property : wordsOf(kind).properties) {
    rows.push_back({std::to_string(property.id) + ' ' + property.name, propertyMeans(property)});
  }
  if (rows.size() == 1) rows.push_back({"none"});
  printTable(out, rows);
  rows = fieldsOf(*findSensor(kind.sensor));
  rows.insert(rows.begin(), {"field", "means"});
  printTable(out, rows);
}

Json text(const char* value) {
  return Json(json_string(value));
}
Json integer(int32_t value) {
  return Json(json_integer(value));
}

Json named(const std::string& name, const std::string& means) {
  Json object(json_object());
  addMember(object, "name", text(name.c_str()));
  addMember(object, "means", text(means.c_str()));
  return object;
}

Json keyJson(const OptionKey& key, const char* means) {
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
  addMember(object, "means", text(means));
  addMember(object, "note", text(orEmpty(key.note)));
  return object;
}

// An array of what `makeElement` makes of each row.
template <class Rows, class MakeElement>
Json arrayOf(const Rows& rows, MakeElement makeElement) {
  Json array(json_array());
  for (const auto& row : rows) json_array_append_new(array.get(), makeElement(row).release());
  return array;
}

Json propertyJson(const model::PropertyRow& property) {
  Json object(json_object());
  addMember(object, "id", integer(property.id));
  addMember(object, "name", text(property.name));
  addMember(object, "means", text(propertyMeans(property).c_str()));
  return object;
}

Json sensorJson(const OptionDescription& kind) {
  Json object(json_object());
  addMember(object, "sensor", text(kind.sensor));
  addMember(object, "title", text(kind.title));
  const model::KindRow& words = wordsOf(kind);
  const auto* key = words.keys.begin();
  addMember(object, "keys", arrayOf(kind.keys, [&key](auto& row) { return keyJson(row, key++->means); }));
  addMember(object, "stringKeys", arrayOf(words.stringKeys, [](auto& row) { return named(row.name, row.means); }));
  addMember(object, "properties", arrayOf(words.properties, propertyJson));
  addMember(object, "fields",
            arrayOf(fieldsOf(*findSensor(kind.sensor)), [](auto& row) { return named(row[0], row[1]); }));
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
