#include "convert/call_table.h"

#include <array>
#include <cinttypes>
#include <cstdio>
#include <optional>
#include <span>

#include "trace/json.h"
#include "trace/property_text.h"
#include "trace/record_codec.h"
#include "trace/record_field.h"
#include "trace/record_value.h"
#include "trace/time_unit.h"
#include "trace/trace_form.h"

namespace senseloom::tool {
namespace {

// What is between commas: in quotes, with each quote doubled, where it would otherwise be misread.
std::string cellText(const std::string& text) {
  if (text.find_first_of(",\"\r\n") == std::string::npos) return text;
  std::string quoted = "\"";
  for (const char c : text) quoted.append(c == '"' ? 2 : 1, c);
  return quoted.append("\"");
}

template <class Integer>
std::string numberText(std::optional<Integer> number) {
  return number ? std::to_string(*number) : "";
}

// The named integer of a record or a result; the number of items if there is none; the classes of the items.
struct RecordCells {
  std::string value;
  std::string items;
  std::string classes;
};

RecordCells cellsOf(const Sensor& sensor, std::span<const uint8_t> record) {
  const auto value = numberText(recordValue(sensor, record));
  if (sensor.value != nullptr) return {.value = value, .items = "", .classes = ""};
  RecordCells cells{.value = "", .items = value, .classes = ""};
  const Json fields = sensor.items == Items::decisions ? decodeResult(sensor, record) : nullptr;
  size_t index;
  json_t* item;
  json_array_foreach(json_object_get(fields.get(), member::kItems), index, item) {
    if (index > 0) cells.classes += ' ';
    cells.classes += std::to_string(json_integer_value(json_object_get(item, member::kClass)));
  }
  return cells;
}

std::string secondsText(uint64_t timestamp, int64_t unit) {
  const auto perSecond = static_cast<uint64_t>(kSecond / unit);
  const uint64_t nanoseconds = (timestamp % perSecond) * static_cast<uint64_t>(unit);
  std::array<char, 40> text;
  std::snprintf(text.data(), text.size(), "%" PRIu64 ".%09" PRIu64, timestamp / perSecond, nanoseconds);
  std::string number = text.data();
  number.erase(number.find_last_not_of('0') + 1);
  if (number.ends_with('.')) number.pop_back();
  return number;
}

std::string toldText(const ExplainedCall* call) {
  if (call == nullptr) return "";
  std::string text;
  for (const auto* list : {&call->told, &call->toldAfter}) {
    for (const Told& told : *list) text.append(text.empty() ? "" : "; ").append(told.text);
  }
  return text;
}

std::string propertiesText(const CallOutcome& outcome) {
  if (!outcome.properties) return "";
  std::string text;
  for (const Property& property : *outcome.properties) {
    text.append(text.empty() ? "" : " ").append(std::to_string(property.id)).append("=").append(valueText(property));
  }
  return text;
}

// What a dispatch has in the columns from the timestamp to the classes of the result.
std::vector<std::string> dispatchCells(const ConvertedCall& converted) {
  const CallOutcome& outcome = converted.outcome;
  const auto timestamp = recordField<uint64_t>(outcome.record, kTimestampOffset);
  const RecordCells record = cellsOf(*outcome.sensor, outcome.record);
  const bool isExplained = converted.record->unexplained.empty();
  const model::Verdict& verdict = converted.record->verdict;
  std::vector<std::string> cells{numberText(timestamp),
                                 timestamp ? secondsText(*timestamp, converted.timeUnit) : "",
                                 record.value,
                                 record.items,
                                 record.classes,
                                 isExplained ? model::fateText(verdict.fate) : "unexplained",
                                 isExplained ? verdict.text() : converted.record->unexplained};
  if (!outcome.result) {
    cells.resize(cells.size() + 4);
    return cells;
  }
  const RecordCells result = cellsOf(*outcome.sensor, *outcome.result);
  cells.insert(cells.end(), {numberText(recordField<uint64_t>(*outcome.result, kTimestampOffset)), result.value,
                             result.items, result.classes});
  return cells;
}

}  // namespace

CallTable::CallTable(OutputSink& output) : sink(output) {
  writeRow({"line", "call", "session", "sensor", "returned", "option", "properties", "timestamp", "seconds", "value",
            "items", "classes", "fate", "why", "result_timestamp", "result_value", "result_items", "result_classes"});
}

void CallTable::add(const ConvertedCall& converted) {
  const CallOutcome& outcome = converted.outcome;
  const CallKind kind = outcome.call.kind;
  std::string returned = std::to_string(outcome.returned);
  if (kind == CallKind::open) returned = outcome.failed ? "" : kHandle;
  std::vector<std::string> cells{outcome.call.line == 0 ? "" : std::to_string(outcome.call.line),
                                 callName(kind),
                                 outcome.session,
                                 outcome.sensor == nullptr ? "" : outcome.sensor->name,
                                 kind == CallKind::uninit ? "" : returned,
                                 outcome.call.option.value_or(""),
                                 propertiesText(outcome)};
  std::vector<std::string> rest{"", "", "", "", "", "", toldText(converted.call), "", "", "", ""};
  if (converted.record != nullptr) rest = dispatchCells(converted);
  cells.insert(cells.end(), rest.begin(), rest.end());
  writeRow(cells);
}

void CallTable::writeRow(const std::vector<std::string>& cells) {
  std::string row;
  for (const std::string& cell : cells) row.append(cellText(cell)).append(1, ',');
  row.back() = '\n';
  sink.write(row);
}

}  // namespace senseloom::tool
