#include "replay/json_output.h"

#include <utility>

#include "trace/hex.h"
#include "sensors/option_data.h"

namespace senseloom::tool {
namespace {

Json text(const std::string& value) {
  return Json(json_string(value.c_str()));
}

Json properties(const CallOutcome& outcome) {
  if (!outcome.properties) return Json(json_null());
  Json list(json_array());
  for (const Property& property : *outcome.properties) {
    Json entry(json_object());
    addMember(entry, "id", Json(json_integer(property.id)));
    addMember(entry, "name", text(propertyName(outcome.sensor->sensor, property.id)));
    if (const auto value = property.integer()) {
      addMember(entry, "value", Json(json_integer(*value)));
    } else {
      addMember(entry, "hex", text(toHex(property.value)));
    }
    json_array_append_new(list.get(), entry.release());
  }
  return list;
}

}  // namespace

Json returnedJson(const CallOutcome& outcome) {
  if (outcome.call.kind != CallKind::open) return Json(json_integer(outcome.returned));
  return outcome.failed ? Json(json_null()) : text("handle");
}

void JsonOutput::onOutcome(const CallOutcome& outcome) {
  const CallKind kind = outcome.call.kind;
  Json object(json_object());
  addMember(object, "line",
            Json(outcome.call.line == 0 ? json_null() : json_integer(static_cast<json_int_t>(outcome.call.line))));
  addMember(object, "call", text(callName(kind)));
  if (kind != CallKind::uninit) {
    addMember(object, "session", text(outcome.session));
    addMember(object, "sensor", text(outcome.sensor->sensor));
    addMember(object, "return", returnedJson(outcome));
  }
  if (kind == CallKind::setOption || kind == CallKind::close) {
    addMember(object, "properties", properties(outcome));
  }
  if (kind == CallKind::dispatch) {
    Json fields;
    if (outcome.result) fields = decodeResult(*outcome.sensor, *outcome.result);
    addMember(object, "result", fields != nullptr ? std::move(fields) : Json(json_null()));
    addMember(object, "hex", outcome.result ? text(toHex(*outcome.result)) : Json(json_null()));
  }
  std::fprintf(out, "%s\n", compactText(object.get()).c_str());
}

}  // namespace senseloom::tool
