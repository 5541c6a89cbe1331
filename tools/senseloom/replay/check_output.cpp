#include "replay/check_output.h"

#include <stdexcept>
#include <string>
#include <utility>

#include "trace/hex.h"
#include "trace/json.h"
#include "replay/json_output.h"

namespace senseloom::tool {
namespace {

Json hexText(std::span<const uint8_t> bytes) {
  return Json(json_string(toHex(bytes).c_str()));
}

Json propertyArray(const PropertyList& properties) {
  Json array(json_array());
  for (const Property& property : properties) {
    Json entry(json_object());
    addMember(entry, "id", Json(json_integer(property.id)));
    addMember(entry, "size", Json(json_integer(static_cast<json_int_t>(property.value.size()))));
    addMember(entry, "value", hexText(property.value));
    json_array_append_new(array.get(), entry.release());
  }
  return array;
}

// What came of a call, in the form of a recording.
Json recordingOf(const CallOutcome& outcome) {
  Json object(json_object());
  addMember(object, "returned", returnedJson(outcome));
  if (outcome.properties) addMember(object, "properties", propertyArray(*outcome.properties));
  if (outcome.result) {
    Json record(json_object());
    addMember(record, "hex", hexText(*outcome.result));
    addMember(object, "result", std::move(record));
  }
  return object;
}

}  // namespace

void CheckOutput::onOutcome(const CallOutcome& outcome) {
  if (outcome.call.recorded == nullptr) {
    if (outcome.call.line != 0) ++unrecorded;  // the closing of a session at the end is no line
    return;
  }
  ++compared;
  const Json actual = recordingOf(outcome);
  if (json_equal(outcome.call.recorded.get(), actual.get())) return;
  ++different;
  std::fprintf(out, "%s: %s of session \"%s\" differs from the recording\n  expected: %s\n  actual:   %s\n",
               trace.position().c_str(), callName(outcome.call.kind), outcome.session.c_str(),
               compactText(outcome.call.recorded.get()).c_str(), compactText(actual.get()).c_str());
}

void CheckOutput::onEnd() {
  if (different != 0) {
    std::fflush(out);  // before the message
    throw std::runtime_error(std::to_string(different) + " of " + std::to_string(compared) + " calls compared differ");
  }
  std::fprintf(out, "%zu calls compared, all as recorded", compared);
  if (unrecorded != 0) std::fprintf(out, "; %zu without a recorded result", unrecorded);
  std::fputc('\n', out);
}

}  // namespace senseloom::tool
