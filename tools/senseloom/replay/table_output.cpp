#include "replay/table_output.h"

#include <algorithm>
#include <cstring>
#include <utility>

#include "kinds/option_data.h"
#include "trace/hex.h"
#include "trace/property_text.h"
#include "trace/record_codec.h"

namespace senseloom::tool {
namespace {

constexpr size_t kMostElements = 4;
constexpr size_t kMostBytes = 16;

std::string shortened(const std::string& digits) {
  return digits.size() <= 2 * kMostBytes ? digits : digits.substr(0, 2 * kMostBytes) + "...";
}

std::string propertiesText(const CallOutcome& outcome) {
  if (outcome.properties->empty()) return "no properties";
  std::string text;
  for (const Property& property : *outcome.properties) {
    if (!text.empty()) text += ", ";
    text += std::to_string(property.id) + ' ' + propertyName(outcome.sensor->name, property.id) + '=' +
            valueText(*outcome.sensor, property);
  }
  return text;
}

std::string returnText(const CallOutcome& outcome) {
  switch (outcome.call.kind) {
    case CallKind::open:
      return outcome.failed ? "NULL" : kHandle;
    case CallKind::uninit:
      return "";
    default:
      return std::to_string(outcome.returned);
  }
}

}  // namespace

void TableOutput::onOutcome(const CallOutcome& outcome) {
  time.pass(outcome);
  if (!form.all && outcome.call.kind == CallKind::dispatch && outcome.returned == 0) return;
  sessionWidth = std::max(sessionWidth, outcome.session.size());
  printRow(outcome.call.line == 0 ? "end" : std::to_string(outcome.call.line), callName(outcome.call.kind),
           outcome.session, outcome.sensor == nullptr ? "" : outcome.sensor->name, returnText(outcome),
           outcomeText(outcome));
}

void TableOutput::onNote(size_t line, const std::string& text) {
  printRow(std::to_string(line), "note", "", "", "", text);
}

std::string TableOutput::outcomeText(const CallOutcome& outcome) const {
  std::string text = givenText(outcome);
  const auto add = [&text](const std::string& part, const char* between) {
    text += (text.empty() ? "" : between) + part;
  };
  if (outcome.failed) add("failed", " -> ");
  if (outcome.properties) add(propertiesText(outcome), outcome.failed ? "; " : " -> ");
  if (outcome.result) add(resultText(outcome), " -> ");
  return text;
}

std::string TableOutput::givenText(const CallOutcome& outcome) const {
  if (outcome.call.kind == CallKind::setOption) return outcome.call.option.value_or("NULL");
  return outcome.call.kind == CallKind::dispatch ? recordText(*outcome.sensor, outcome.record, decodeRecord) : "";
}

std::string TableOutput::resultText(const CallOutcome& outcome) const {
  const bool isRecord =
      std::equal(outcome.record.begin(), outcome.record.end(), outcome.result->begin(), outcome.result->end());
  return isRecord ? "the record" : recordText(*outcome.sensor, *outcome.result, decodeResult);
}

std::string TableOutput::recordText(const Sensor& sensor, std::span<const uint8_t> bytes, Decode* decode) const {
  if (form.hex) return bytes.empty() ? "no bytes" : toHex(bytes);
  const Json fields = decode(sensor, bytes);
  return fields != nullptr ? fieldsText(fields.get(), sensor) : bytesText(bytes);
}

std::string TableOutput::fieldsText(json_t* value, const Sensor& sensor) const {
  if (json_is_integer(value)) return std::to_string(json_integer_value(value));
  if (json_is_string(value)) return shortened(json_string_value(value));
  std::string text;
  if (json_is_object(value)) {
    const char* key;
    json_t* member;
    json_object_foreach(value, key, member) {
      if (!text.empty()) text += ' ';
      text += std::string(key) + '=' + fieldsText(member, sensor);
      if (std::strcmp(key, member::kClass) == 0) text += nameText(sensor, json_integer_value(member));
    }
    return text;
  }
  const size_t count = json_array_size(value);
  for (size_t i = 0; i < std::min(count, kMostElements); ++i) {
    if (i > 0) text += ", ";
    text += fieldsText(json_array_get(value, i), sensor);
  }
  if (count > kMostElements) text += ", ... (" + std::to_string(count) + ')';
  return '[' + text + ']';
}

std::string TableOutput::nameText(const Sensor& sensor, int64_t classNumber) const {
  const std::string name =
      className(sensor, form.classNames.empty() ? trace.classNames() : form.classNames, classNumber);
  return name.empty() ? "" : " (" + name + ')';
}

std::string TableOutput::timeText() const {
  const auto nanoseconds = form.times == Times::clock ? time.since1970() : time.sinceStart();
  if (!nanoseconds) return "";
  return form.times == Times::clock ? clockText(*nanoseconds) : elapsedText(*nanoseconds);
}

void TableOutput::printHeading() {
  if (std::exchange(headed, true)) return;
  printCells({"line", "time", "call", "session", "sensor", "return", "outcome"});
}

void TableOutput::printRow(std::string_view line, std::string_view call, std::string_view session,
                           std::string_view sensor, std::string_view returned, std::string_view text) {
  printHeading();
  printCells({line, form.times == Times::none ? "" : timeText(), call, session, sensor, returned, text});
}

void TableOutput::printCells(const Cells& cells) {
  const auto cell = [](std::string_view value, size_t width) {
    std::string padded(value);
    padded.append(2 + width - std::min(width, padded.size()), ' ');
    return padded;
  };
  std::string row(6 - std::min<size_t>(6, cells.line.size()), ' ');
  row += cell(cells.line, cells.line.size());
  if (form.times != Times::none) row += cell(cells.time, form.times == Times::clock ? 23 : 12);
  row += cell(cells.call, 10) + cell(cells.session, sessionWidth) + cell(cells.sensor, 6) + cell(cells.returned, 6);
  row += cells.text;
  row.erase(row.find_last_not_of(' ') + 1);
  row += '\n';
  std::fwrite(row.data(), 1, row.size(), out);
}

}  // namespace senseloom::tool
