#include "sweep/script_reader.h"

#include <limits>
#include <utility>

#include "input_error.h"
#include "sweep/truth_file.h"
#include "trace/json.h"
#include "trace/record_codec.h"
#include "trace/record_field.h"
#include "trace/time_unit.h"

namespace senseloom::tool {
namespace {

// Whether the library takes items from the record into a batch.
bool holdsItems(const Sensor& sensor, std::span<const uint8_t> record) {
  if (sensor.items != Items::decisions) return true;
  const auto count = recordField<int16_t>(record, kValueOffset).value_or(0);
  return count > 0 && record.size() >= kItemsOffset + 2 * static_cast<size_t>(count);
}

void markChanges(std::vector<SweepRecord>& records) {
  int32_t label = 0;
  SweepRecord* change = nullptr;
  for (size_t i = 0; i < records.size(); ++i) {
    SweepRecord& record = records[i];
    if (record.label == 0) continue;
    if (label != 0 && record.label != label) {
      record.isChange = true;
      change = &record;
    }
    if (change != nullptr) change->labelEnds = i;
    label = record.label;
  }
}

}  // namespace

SweepScript ScriptReader::read(const std::string& file) {
  TraceReader trace(file);
  if (client.session.empty()) begin();
  try {
    while (const auto call = trace.next()) {
      unit = fixedUnit != 0 ? fixedUnit : trace.timeUnit().value_or(kMillisecond);
      take(*call);
    }
  } catch (const InputError& error) {
    throw InputError(trace.position() + ": " + error.what());
  }
  if (client.sensor == nullptr) {
    throw InputError(trace.fileName() + ": no session \"" + client.session + "\" is opened");
  }
  if (script.records.empty()) {
    const std::string target =
        client.session.empty() ? std::string("sensor ") + client.sensor->name : "session \"" + client.session + '"';
    throw InputError(trace.fileName() + ": no record reaches " + target);
  }
  if (!truthFile.empty()) {
    const TruthFile truth(truthFile, unit);
    for (SweepRecord& record : script.records) record.label = truth.labelAt(record.time);
  }
  // Calls on other sensors change nothing here. Which sensor it is may be known last.
  for (auto& [step, sensor] : steps) {
    if (sensor == nullptr || sensor == client.sensor) script.steps.push_back(std::move(step));
  }
  markChanges(script.records);
  return std::move(script);
}

void ScriptReader::take(const TraceCall& call) {
  switch (call.kind) {
    case CallKind::open:
      open(call);
      break;
    case CallKind::setOption:
      setOption(call);
      break;
    case CallKind::dispatch:
      dispatch(call);
      break;
    case CallKind::close:
      close(call);
      break;
    case CallKind::uninit:
      ++uninits;
      addStep({.kind = CallKind::uninit}, nullptr);
      break;
  }
}

// The swept session is open from here on, and gets its option. A trace that sets one replaces it.
void ScriptReader::begin() {
  isOpen = true;
  openedAfter = uninits;
  hasPrevious = false;
  addStep({.kind = CallKind::open}, client.sensor);
  ownOption = steps.size();
  addStep({.kind = CallKind::setOption, .head = headOf(client.option)}, client.sensor);
}

void ScriptReader::open(const TraceCall& call) {
  // A session that never opened leaves its name free.
  const auto known = sessions.find(call.session);
  if (known != sessions.end() && !known->second.failed) {
    throw InputError("session \"" + call.session + "\" is already open");
  }
  if (known != sessions.end()) sessions.erase(known);
  const bool isSwept = call.session == client.session;
  if (isSwept) {
    if (client.sensor == nullptr) client.sensor = call.sensor;
    if (client.sensor != call.sensor) {
      throw InputError("session \"" + call.session + "\" is on " + call.sensor->name + " here, and on " +
                       client.sensor->name + " before");
    }
    begin();
  }
  const size_t number = isSwept ? 0 : script.clients++;
  if (!isSwept) addStep({.kind = CallKind::open, .client = number}, call.sensor);
  const json_t* returned = json_object_get(call.recorded.get(), member::kReturned);
  sessions.emplace(call.session, Session{call.sensor, number, json_is_null(returned)});
}

void ScriptReader::setOption(const TraceCall& call) {
  const Session& session = require(call.session);
  if (session.client != 0) {
    addStep({.kind = CallKind::setOption, .client = session.client, .text = call.option}, session.sensor);
    return;
  }
  if (ownOption) steps.erase(steps.begin() + static_cast<std::ptrdiff_t>(*std::exchange(ownOption, {})));
  addStep({.kind = CallKind::setOption, .head = headOf(call.option)}, session.sensor);
}

void ScriptReader::dispatch(const TraceCall& call) {
  const bool isForOne = call.sensor == nullptr;
  const Session* target = isForOne ? &require(call.session) : nullptr;
  const Sensor* sensor = isForOne ? target->sensor : call.sensor;
  const auto bytes = encodeRecord(*sensor, call.record.get());
  const bool isNew = isNewRecord(call, *sensor, bytes);
  const bool reaches =
      isOpen && sensor == client.sensor && (!isForOne || target->client == 0 || (client.session.empty() && isNew));
  if (reaches) addRecord(call, bytes);
  if (sensor->items != Items::samples) return;
  for (const auto& [name, session] : sessions) {
    const bool gets = isForOne ? name == call.session : session.sensor == sensor;
    if (!gets || session.client == 0) continue;
    addStep(
        {.kind = CallKind::dispatch, .client = session.client, .record = script.foreign.size(), .engine = call.engine},
        sensor);
    script.foreign.push_back(store(bytes));
  }
}

void ScriptReader::close(const TraceCall& call) {
  const Session session = require(call.session);
  sessions.erase(call.session);
  addStep({.kind = CallKind::close, .client = session.client}, session.sensor);
  if (session.client != 0) return;
  isOpen = false;
  ownOption.reset();
}

// A trace of a service has one dispatch a session. A record is another one than the last if it has other bytes, or if
// the session had the last one already.
bool ScriptReader::isNewRecord(const TraceCall& call, const Sensor& sensor, const std::vector<uint8_t>& bytes) {
  if (sensor.name != offeredOn || bytes != offered || call.sensor != nullptr || offeredTo.contains(call.session)) {
    offeredOn = call.sensor == nullptr ? sensor.name : "";
    offered = bytes;
    offeredTo = {call.session};
    return true;
  }
  offeredTo.insert(call.session);
  return false;
}

void ScriptReader::addRecord(const TraceCall& call, const std::vector<uint8_t>& bytes) {
  const auto timestamp = recordField<uint64_t>(bytes, kTimestampOffset);
  if (!timestamp) throw InputError("the record ends before its timestamp does");
  const int64_t time = timeOf(*timestamp, unit);
  if (!script.records.empty()) {
    SweepRecord& previous = script.records.back();
    if (time < previous.time) {
      throw InputError("the timestamp " + std::to_string(*timestamp) + " is before that of the record before");
    }
    if (hasPrevious) previous.lasts = time - previous.time;
  }
  hasPrevious = true;
  addStep({.kind = CallKind::dispatch, .record = script.records.size(), .engine = call.engine}, client.sensor);
  script.records.push_back(
      {.bytes = store(bytes), .time = time, .label = labelOf(call), .holdsItems = holdsItems(*client.sensor, bytes)});
}

StoredBytes ScriptReader::store(const std::vector<uint8_t>& bytes) {
  const StoredBytes stored{script.bytes.size(), bytes.size()};
  script.bytes.insert(script.bytes.end(), bytes.begin(), bytes.end());
  return stored;
}

int32_t ScriptReader::labelOf(const TraceCall& call) const {
  const json_t* label = call.truth.get();
  if (!truthFile.empty() || label == nullptr || json_is_null(label)) return 0;
  using Limits = std::numeric_limits<int32_t>;
  if (!json_is_integer(label) || json_integer_value(label) < Limits::min() ||
      json_integer_value(label) > Limits::max()) {
    throw InputError("\"truth\" must be the number of a class");
  }
  return static_cast<int32_t>(json_integer_value(label));
}

// The option string up to where the swept members begin: without those, and without its closing bracket.
std::string ScriptReader::headOf(const std::optional<std::string>& option) const {
  const Json root(option ? json_loads(option->c_str(), 0, nullptr) : nullptr);
  if (!json_is_object(root.get())) {
    throw InputError("the option " + (option ? *option : "null") + " is not a JSON object, so no key of it can be set");
  }
  for (const std::string& key : client.keys) json_object_del(root.get(), key.c_str());
  std::string head = compactText(root.get());
  head.pop_back();
  return json_object_size(root.get()) == 0 ? head : head + ',';
}

// `sensor` null: it is a step of all sensors.
void ScriptReader::addStep(SweepStep step, const Sensor* sensor) {
  step.rebuilds = isOpen && openedAfter == uninits;
  steps.emplace_back(std::move(step), sensor);
}

const ScriptReader::Session& ScriptReader::require(const std::string& name) const {
  const auto session = sessions.find(name);
  if (session == sessions.end()) throw InputError("no session \"" + name + "\" is open");
  return session->second;
}

}  // namespace senseloom::tool
