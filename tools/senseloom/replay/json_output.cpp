#include "replay/json_output.h"

#include <utility>

#include "kinds/option_data.h"
#include "trace/hex.h"
#include "trace/json.h"
#include "trace/record_codec.h"

namespace senseloom::tool {
namespace {

Json orNull(Json value) {
  return value != nullptr ? std::move(value) : Json(json_null());
}

Json properties(const CallOutcome& outcome) {
  if (!outcome.properties) return Json(json_null());
  Json list(json_array());
  for (const Property& property : *outcome.properties) {
    Json entry(json_object());
    addMember(entry, member::kId, Json(json_integer(property.id)));
    addMember(entry, "name", textJson(propertyName(outcome.sensor->name, property.id)));
    if (const auto value = property.integer()) {
      addMember(entry, member::kValue, Json(json_integer(*value)));
    } else {
      addMember(entry, member::kHex, textJson(toHex(property.value)));
    }
    json_array_append_new(list.get(), entry.release());
  }
  return list;
}

// What the library returned: a number; for an open whether it gave a handle.
Json returned(const CallOutcome& outcome) {
  if (outcome.call.kind != CallKind::open) return Json(json_integer(outcome.returned));
  return outcome.failed ? Json(json_null()) : textJson(kHandle);
}

}  // namespace

void JsonOutput::onOutcome(const CallOutcome& outcome) {
  const CallKind kind = outcome.call.kind;
  Json object(json_object());
  addMember(object, "line",
            Json(outcome.call.line == 0 ? json_null() : json_integer(static_cast<json_int_t>(outcome.call.line))));
  addMember(object, member::kCall, textJson(callName(kind)));
  if (kind != CallKind::uninit) {
    addMember(object, member::kSession, textJson(outcome.session));
    addMember(object, member::kSensor, textJson(outcome.sensor->name));
    addMember(object, "return", returned(outcome));
  }
  if (kind == CallKind::setOption) {
    const auto& option = outcome.call.option;
    addMember(object, member::kOption, orNull(option ? textJson(*option) : nullptr));
  }
  if (kind == CallKind::setOption || kind == CallKind::close) {
    addMember(object, member::kProperties, properties(outcome));
  }
  if (kind == CallKind::dispatch) {
    addMember(object, member::kRecord, orNull(decodeRecord(*outcome.sensor, outcome.record)));
    addMember(object, "recordHex", textJson(toHex(outcome.record)));
    Json fields;
    if (outcome.result) fields = decodeResult(*outcome.sensor, *outcome.result);
    addMember(object, member::kResult, orNull(std::move(fields)));
    addMember(object, member::kHex, outcome.result ? textJson(toHex(*outcome.result)) : Json(json_null()));
  }
  std::fprintf(out, "%s\n", compactText(object.get()).c_str());
}

void JsonOutput::onNote(size_t line, const std::string& note) {
  Json object(json_object());
  addMember(object, "line", Json(json_integer(static_cast<json_int_t>(line))));
  addMember(object, member::kNote, textJson(note));
  std::fprintf(out, "%s\n", compactText(object.get()).c_str());
}

}  // namespace senseloom::tool
