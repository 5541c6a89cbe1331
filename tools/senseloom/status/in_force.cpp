#include "status/in_force.h"

#include <cstdlib>

#include "kinds/option_data.h"
#include "trace/hex.h"
#include "trace/replayer.h"
#include "trace/trace_call.h"
#include "trace/trace_form.h"

namespace senseloom::tool {
namespace {

// Sessions are named s1, s2 and so on; s0 is one that came and went for the others to negotiate.
uint32_t numberOf(const std::string& session) {
  return static_cast<uint32_t>(std::strtoul(session.c_str() + 1, nullptr, 10));
}

std::string propertyText(const Sensor& sensor, const json_t* entry) {
  const auto id = static_cast<int32_t>(json_integer_value(json_object_get(entry, member::kId)));
  const auto bytes = fromHex(textMember(entry, member::kValue));
  Property property{.id = id, .value = bytes.value_or(std::vector<uint8_t>()), .isBytes = id == sensor.bytesProperty};
  const auto value = property.integer();
  return std::to_string(id) + ' ' + propertyName(sensor.name, id) + '=' +
         (value ? std::to_string(*value) : std::to_string(property.value.size()) + " bytes");
}

}  // namespace

InForceNow::InForceNow(std::string_view lines) {
  while (!lines.empty()) {
    const size_t length = lines.find('\n') + 1;
    const Json object(json_loadb(lines.data(), length, 0, nullptr));
    if (object != nullptr) take(object);
    lines.remove_prefix(length);
  }
}

std::string InForceNow::properties(const Sensor& sensor) const {
  const auto found = lists.find(&sensor);
  return found == lists.end() ? "" : found->second;
}

void InForceNow::take(const Json& object) {
  const std::string session = textMember(object.get(), member::kSession);
  if (!session.empty()) return takeCall(object, numberOf(session));
  const Sensor* sensor = findSensor(textMember(object.get(), member::kSensor));
  if (sensor != nullptr) takeProperties(*sensor, object);
}

void InForceNow::takeCall(const Json& object, uint32_t session) {
  const std::string call = textMember(object.get(), member::kCall);
  if (call == callName(CallKind::open)) {
    const Sensor* sensor = findSensor(textMember(object.get(), member::kSensor));
    const bool hasFailed = json_is_null(json_object_get(object.get(), member::kReturned));
    if (sensor != nullptr && !hasFailed) open[session] = {sensor, std::nullopt};
    return;
  }
  const auto found = open.find(session);
  if (found == open.end()) return;
  takeProperties(*found->second.sensor, object);
  if (call == callName(CallKind::close)) {
    open.erase(found);
  } else if (json_integer_value(json_object_get(object.get(), member::kReturned)) == 0 &&
             json_object_get(object.get(), member::kRefused) == nullptr) {
    found->second.option = readCall(object).option;
  }
}

void InForceNow::takeProperties(const Sensor& sensor, const Json& object) {
  const json_t* list = json_object_get(object.get(), member::kProperties);
  if (list == nullptr) return;
  std::string text;
  size_t index;
  json_t* entry;
  json_array_foreach(list, index, entry) {
    if (!text.empty()) text += ", ";
    text += propertyText(sensor, entry);
  }
  lists[&sensor] = text.empty() ? "no properties" : text;
}

}  // namespace senseloom::tool
