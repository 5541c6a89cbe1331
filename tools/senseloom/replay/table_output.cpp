#include "replay/table_output.h"

#include <algorithm>

#include "kinds/option_data.h"
#include "trace/json.h"
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

std::string fieldsText(json_t* value) {
  if (json_is_integer(value)) return std::to_string(json_integer_value(value));
  if (json_is_string(value)) return shortened(json_string_value(value));
  std::string text;
  if (json_is_object(value)) {
    const char* key;
    json_t* member;
    json_object_foreach(value, key, member) {
      if (!text.empty()) text += ' ';
      text += std::string(key) + '=' + fieldsText(member);
    }
    return text;
  }
  const size_t count = json_array_size(value);
  for (size_t i = 0; i < std::min(count, kMostElements); ++i) {
    if (i > 0) text += ", ";
    text += fieldsText(json_array_get(value, i));
  }
  if (count > kMostElements) text += ", ... (" + std::to_string(count) + ')';
  return '[' + text + ']';
}

std::string resultText(const CallOutcome& outcome) {
  const Json fields = decodeResult(*outcome.sensor, *outcome.result);
  return fields != nullptr ? fieldsText(fields.get()) : bytesText(*outcome.result);
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

std::string outcomeText(const CallOutcome& outcome) {
  std::string text = outcome.failed ? "failed" : "";
  if (outcome.properties) {
    if (!text.empty()) text += "; ";
    text += propertiesText(outcome);
  }
  if (outcome.result) text += resultText(outcome);
  return text;
}

}  // namespace

void TableOutput::onOutcome(const CallOutcome& outcome) {
  if (!headed) {
    printRow("line", "call", "session", "sensor", "return", "outcome");
    headed = true;
  }
  if (!all && outcome.call.kind == CallKind::dispatch && outcome.returned == 0) return;
  sessionWidth = std::max(sessionWidth, outcome.session.size());
  printRow(outcome.call.line == 0 ? "end" : std::to_string(outcome.call.line), callName(outcome.call.kind),
           outcome.session, outcome.sensor == nullptr ? "" : outcome.sensor->name, returnText(outcome),
           outcomeText(outcome));
}

void TableOutput::printRow(std::string_view line, std::string_view call, std::string_view session,
                           std::string_view sensor, std::string_view returned, std::string_view text) {
  const auto cell = [](std::string_view value, size_t width) {
    std::string padded(value);
    padded.append(2 + width - std::min(width, padded.size()), ' ');
    return padded;
  };
  std::string row(6 - std::min<size_t>(6, line.size()), ' ');
  row += cell(line, line.size()) + cell(call, 10) + cell(session, sessionWidth) + cell(sensor, 6) + cell(returned, 6);
  row += text;
  row.erase(row.find_last_not_of(' ') + 1);
  row += '\n';
  std::fwrite(row.data(), 1, row.size(), out);
}

}  // namespace senseloom::tool
