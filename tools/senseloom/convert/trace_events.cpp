#include "convert/trace_events.h"

#include <algorithm>
#include <utility>

#include "kinds/option_data.h"
#include "trace/record_field.h"
#include "trace/time_unit.h"

namespace senseloom::tool {
namespace {

constexpr int kRecordsThread = 1;

// Of all that a record or a result shows, what it shows most.
std::string nameOf(const Sensor& sensor, const RecordHues& content) {
  const auto* const most = std::ranges::max_element(content.counts);
  const std::string text = hueText(sensor, static_cast<size_t>(most - content.counts.begin()), {});
  return hasClasses(sensor) ? text : text + ' ' + std::to_string(content.height);
}

// Times of the form are in microseconds.
Json microseconds(int64_t nanoseconds) {
  return Json(json_real(static_cast<double>(nanoseconds) / 1000));
}

Json instant(const char* scope) {
  Json more(json_object());
  addMember(more, "s", textJson(scope));
  return more;
}

// Why a call came to what it came to, by keys.
Json argumentsOf(const ExplainedCall& call) {
  Json arguments(json_object());
  size_t number = 0;
  for (const auto* list : {&call.told, &call.toldAfter}) {
    for (const Told& told : *list)
      addMember(arguments, ("told " + std::to_string(++number)).c_str(), textJson(told.text));
  }
  if (!call.negotiation) return arguments;
  const ExplainedNegotiation& negotiation = *call.negotiation;
  const auto& keys = model::rowOf(model::kindNamed(call.outcome.sensor->name)).keys;
  for (size_t key = 0; key < keys.size(); ++key) {
    const model::MergedKey& merged = negotiation.derived->keys[key];
    const std::string value = merged.value ? std::to_string(*merged.value) + ", " : "";
    addMember(arguments, keys.begin()[key].name, textJson(value + "decided by: " + merged.deciders(negotiation.names)));
  }
  return arguments;
}

}  // namespace

TraceEvents::TraceEvents(OutputSink& output) : sink(output) {
  sink.write("{\"displayTimeUnit\":\"ms\",\"traceEvents\":[");
}

void TraceEvents::add(const ConvertedCall& converted) {
  if (converted.outcome.call.kind == CallKind::dispatch) {
    dispatch(converted);
  } else if (converted.outcome.sensor != nullptr) {
    noteCall(converted);
  }
}

void TraceEvents::end() {
  for (const auto& write : std::exchange(waiting, {})) write();
  for (Track& track : tracks) finish(track, true);
  sink.write("\n]}\n");
}

void TraceEvents::dispatch(const ConvertedCall& converted) {
  const CallOutcome& outcome = converted.outcome;
  Track& records = trackOf(outcome.sensor, std::nullopt);
  Track& session = trackOf(outcome.sensor, outcome.session);
  if (const auto timestamp = recordField<uint64_t>(outcome.record, kTimestampOffset)) {
    now = timeOf(*timestamp, converted.timeUnit);
  }
  for (const auto& write : std::exchange(waiting, {})) write();
  if (joiner.isNew(outcome)) show(records, huesOf(*outcome.sensor, outcome.record, false));

  const model::Verdict& verdict = converted.record->verdict;
  const std::string& unexplained = converted.record->unexplained;
  if (outcome.result) show(session, huesOf(*outcome.sensor, *outcome.result, true));
  if (!unexplained.empty()) write("i", "unexplained", session, "unexplained: " + unexplained, now, instant("t"));
  if (outcome.failed && unexplained.empty()) write("i", "refused", session, verdict.text(), now, instant("t"));
  const bool isFilling = verdict.fate == model::Fate::batchFilling;
  session.hasBatch |= isFilling;
  if (!session.hasBatch || outcome.failed) return;
  Json counter(json_object());
  Json value(json_object());
  addMember(value, "items", Json(json_integer(isFilling ? verdict.first : 0)));
  addMember(counter, "args", std::move(value));
  write("C", "batch", session, "batch of " + outcome.session, now, std::move(counter));
}

void TraceEvents::show(Track& track, const RecordHues& content) {
  const std::string name = nameOf(*track.sensor, content);
  if (!track.sensor->lasts) {
    write("i", track.session ? "result" : "record", track, name, now, instant("t"));
    return;
  }
  if (track.held && track.held->name == name) return;
  finish(track, false);
  track.held = Held{name, now};
}

void TraceEvents::noteCall(const ConvertedCall& converted) {
  const CallOutcome& outcome = converted.outcome;
  const CallKind kind = outcome.call.kind;
  Track& track = trackOf(outcome.sensor, outcome.session);
  // At the end of the trace it is the tool that closes what is open.
  const bool isToTell = converted.call != nullptr && outcome.call.line != 0;
  const std::string what = isToTell ? converted.call->what : "";
  // Json alone cannot be copied, as a function must be.
  const std::shared_ptr<json_t> arguments(isToTell ? argumentsOf(*converted.call).release() : nullptr, json_decref);
  joiner.end();
  waiting.emplace_back([this, &track, kind, failed = outcome.failed, what, arguments] {
    if (arguments != nullptr) {
      Json more = instant("p");
      addMember(more, "args", Json(json_incref(arguments.get())));
      write("i", failed ? "refused" : "negotiation", track, *track.session + ' ' + what, now, std::move(more));
    }
    if (kind == CallKind::open && !failed) track.openSince = now;
    if (kind == CallKind::close) finish(track, true);
  });
}

void TraceEvents::finish(Track& track, bool isClosed) {
  const auto slice = [&](const char* category, const std::string& name, int64_t since) {
    Json more(json_object());
    addMember(more, "dur", microseconds(std::max<int64_t>(now - since, 0)));
    write("X", category, track, name, since, std::move(more));
  };
  if (track.held) slice("class", track.held->name, track.held->since);
  track.held.reset();
  if (isClosed && track.openSince) slice("session", "open", *std::exchange(track.openSince, {}));
}

TraceEvents::Track& TraceEvents::trackOf(const Sensor* sensor, const std::optional<std::string>& session) {
  int threads = kRecordsThread - 1;
  int process = 0;
  for (Track& track : tracks) {
    if (track.sensor != sensor) continue;
    if (track.session == session) return track;
    process = track.process;
    ++threads;
  }
  if (process == 0) {
    Track& records = tracks.emplace_back(Track{sensor, std::nullopt, ++processes, ++threads});
    process = records.process;
    describe("process_name", records, std::string(sensor->name) + ' ' + findOptionDescription(sensor->name)->title);
    describe("thread_name", records, "records");
    if (!session) return records;
  }
  Track& track = tracks.emplace_back(Track{sensor, session, process, ++threads});
  describe("thread_name", track, *session);
  return track;
}

void TraceEvents::describe(const char* what, const Track& track, const std::string& name) {
  Json object(json_object());
  addMember(object, "name", textJson(what));
  addMember(object, "ph", textJson("M"));
  addMember(object, "pid", Json(json_integer(track.process)));
  addMember(object, "tid", Json(json_integer(track.thread)));
  Json arguments(json_object());
  addMember(arguments, "name", textJson(name));
  addMember(object, "args", std::move(arguments));
  writeObject(object);
}

void TraceEvents::write(const char* phase, const char* category, const Track& track, const std::string& name,
                        int64_t at, Json more) {
  addMember(more, "name", textJson(name));
  addMember(more, "cat", textJson(category));
  addMember(more, "ph", textJson(phase));
  addMember(more, "ts", microseconds(at));
  addMember(more, "pid", Json(json_integer(track.process)));
  addMember(more, "tid", Json(json_integer(track.thread)));
  writeObject(more);
}

void TraceEvents::writeObject(const Json& object) {
  sink.write((isFirst ? "\n" : ",\n") + compactText(object.get()));
  isFirst = false;
}

}  // namespace senseloom::tool
