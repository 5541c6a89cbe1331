#include "trace/recorded_calls.h"

#include "input_error.h"
#include "trace/record_codec.h"
#include "trace/trace_form.h"

namespace senseloom::tool {

bool RecordedCalls::takes(const TraceCall& call) {
  const json_t* returned = json_object_get(call.recorded.get(), member::kReturned);
  const bool hasFailed = json_is_null(returned) || json_integer_value(returned) < 0;
  hasCalls = true;
  if (returned != nullptr) hasOutcomes = true;
  const auto known = sessions.find(call.session);
  lastSensor = call.sensor == nullptr && known != sessions.end() ? known->second.sensor : call.sensor;
  const bool hasRecord = call.record != nullptr && lastSensor != nullptr;
  lastRecord = hasRecord ? encodeRecord(*lastSensor, call.record.get()) : std::vector<uint8_t>();
  const auto isTakenFor = [&](const std::string& session) {
    const CallOutcome outcome{
        .call = call, .session = session, .sensor = lastSensor, .failed = hasFailed, .record = lastRecord};
    const bool isTaken = filter.takes(outcome);
    isLastWithin = filter.isWithin(outcome);
    isLastBehind = filter.isBehind(outcome);
    return isTaken;
  };
  bool isTaken = isTakenFor(call.session);
  if (call.kind == CallKind::dispatch && call.session.empty()) {
    for (const auto& [name, session] : sessions) {
      if (session.isOpen && session.sensor == call.sensor) isTaken = isTaken || isTakenFor(name);
    }
  }
  noteSession(call, hasFailed);
  return isTaken;
}

void RecordedCalls::noteSession(const TraceCall& call, bool hasFailed) {
  if (call.kind == CallKind::open) sessions[call.session] = {call.sensor, !hasFailed};
  const auto known = sessions.find(call.session);
  if (call.kind == CallKind::close && known != sessions.end()) known->second.isOpen = false;
}

void RecordedCalls::requireOutcomes() const {
  if (!arguments.failed || hasOutcomes || !hasCalls) return;
  throw InputError(trace.fileName() +
                   ": --failed takes a recording: this trace does not tell what its calls returned, but \"senseloom "
                   "replay --failed\" does");
}

}  // namespace senseloom::tool
