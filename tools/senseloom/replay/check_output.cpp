#include "replay/check_output.h"

#include <stdexcept>
#include <string>
#include <string_view>

#include "compare/call_difference.h"
#include "trace/json.h"
#include "trace/trace_line.h"

namespace senseloom::tool {
namespace {

// The outcome of a call, as a recording tells it.
Json recordingOf(const CallOutcome& outcome) {
  TraceLine line;
  if (outcome.call.kind == CallKind::open) {
    line.addOpened(!outcome.failed);
  } else {
    line.addReturned(outcome.returned);
  }
  if (outcome.properties) {
    line.beginArray(member::kProperties);
    for (const Property& property : *outcome.properties) line.addProperty(property.id, property.value);
    line.endArray();
  }
  if (outcome.result) line.addBytes(member::kResult, *outcome.result);
  const std::string_view text = line.finish();
  return Json(json_loadb(text.data(), text.size(), 0, nullptr));
}

}  // namespace

void CheckOutput::onOutcome(const CallOutcome& outcome) {
  hasEngine |= outcome.call.engine.has_value();
  if (outcome.call.isResumed) resumed[outcome.session] = outcome.sensor;
  if (outcome.call.recorded == nullptr) {
    if (outcome.call.line != 0) ++unrecorded;  // closing a session at the end has no line
    return;
  }
  const Json actual = recordingOf(outcome);
  const bool isAsRecorded = json_equal(outcome.call.recorded.get(), actual.get()) != 0;
  if (isInMiddle(outcome, isAsRecorded)) {
    ++inMiddle;
    return;
  }
  ++compared;
  if (isAsRecorded) return;
  if (++different <= form.most) printDifference(outcome, actual.get());
}

void CheckOutput::printDifference(const CallOutcome& outcome, const json_t* actual) {
  const Differences differences = outcomeDifferences(outcome.sensor, outcome.call.recorded.get(), actual);
  const char* call = callName(outcome.call.kind);
  if (form.json) {
    Json object(json_object());
    addMember(object, "line", Json(json_integer(static_cast<json_int_t>(outcome.call.line))));
    addMember(object, member::kCall, Json(json_string(call)));
    addMember(object, member::kSession, Json(json_string(outcome.session.c_str())));
    addMember(object, "isFirst", Json(json_boolean(different == 1)));
    addMember(object, "differences", differencesJson("recorded", "now", differences));
    std::fprintf(out, "%s\n", compactText(object.get()).c_str());
    return;
  }
  std::fprintf(out, "%s: %s of session \"%s\" differs from the recording\n", trace.position().c_str(), call,
               outcome.session.c_str());
  printDifferences(out, "recorded", "now", differences);
  const bool dependsOnEngine = outcome.call.kind == CallKind::dispatch && outcome.sensor->items == Items::samples;
  if (dependsOnEngine && !hasEngine) {
    std::fputs("  the recording does not hold what the platform's gesture engine answered\n", out);
  }
  if (different == 1) std::fputs("  this is the first difference: what follows may come of it\n", out);
}

bool CheckOutput::isInMiddle(const CallOutcome& outcome, bool isAsRecorded) {
  if (resumed.empty()) return false;
  if (outcome.call.kind == CallKind::setOption || outcome.call.kind == CallKind::close) {
    // All sessions of the sensor start over with a negotiation.
    if (outcome.properties) std::erase_if(resumed, [&](auto& session) { return session.second == outcome.sensor; });
    return false;
  }
  if (outcome.call.kind != CallKind::dispatch || resumed.count(outcome.session) == 0) return false;
  if (isAsRecorded && outcome.result) resumed.erase(outcome.session);
  return !isAsRecorded;
}

void CheckOutput::onEnd() {
  if (different > form.most && !form.json) std::fprintf(out, "%zu more calls differ\n", different - form.most);
  std::fflush(out);  // before a message
  if (different != 0) {
    throw std::runtime_error(std::to_string(different) + " of " + std::to_string(compared) + " calls compared differ");
  }
  if (compared == 0) {
    throw std::runtime_error("nothing was compared: none of " + std::to_string(unrecorded + inMiddle) +
                             " calls has a recorded result to compare with");
  }
  if (form.json) return;
  std::fprintf(out, "%zu calls compared, all as recorded", compared);
  if (unrecorded != 0) std::fprintf(out, "; %zu without a recorded result", unrecorded);
  if (inMiddle != 0) std::fprintf(out, "; %zu of sessions in the middle of a batch not compared", inMiddle);
  std::fputc('\n', out);
}

}  // namespace senseloom::tool
