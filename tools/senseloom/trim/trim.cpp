#include "trim/trim.h"

#include <functional>
#include <memory>
#include <optional>
#include <set>
#include <string_view>
#include <unordered_set>
#include <utility>
#include <vector>

#include "input_error.h"
#include "model/kinds.h"
#include "terminal/new_file.h"
#include "terminal/output_sink.h"
#include "trace/record_field.h"
#include "trace/recorded_calls.h"
#include "trace/trace_reader.h"

namespace senseloom::tool {
namespace {

// A session that has not had a result for longer is cut off.
constexpr size_t kMostCarried = 10'000;
constexpr mode_t kOwnerAlone = 0600;  // a trace holds what the sensors saw

void discard(const std::string& /*remark*/) {}

// The sensors of the sessions that are named, or of the calls that failed if those are wanted.
std::set<std::string> sensorsOf(const std::string& trace, const FilterArguments& arguments) {
  if (trace == "-") throw InputError("standard input cannot be read twice, as --session and --failed take");
  TraceReader reader(trace, discard);
  RecordedCalls calls(arguments, reader);
  std::set<std::string> sensors;
  try {
    while (const auto call = reader.next()) {
      const bool isTaken = calls.takes(*call);
      const bool isNamed = call->kind == CallKind::open && calls.takes(call->session, call->sensor);
      if (calls.sensor() != nullptr && (arguments.failed ? isTaken : isNamed)) {
        sensors.insert(calls.sensor()->name);
      }
    }
  } catch (const InputError& error) {
    throw InputError(reader.position() + ": " + error.what());
  }
  calls.requireOutcomes();
  if (!sensors.empty()) return sensors;
  throw InputError(trace + (arguments.failed ? ": none of the calls failed" : ": no session of that name is opened"));
}

// A record from before the part, without its outcome.
struct Carried {
  std::string session;
  const Sensor* sensor;
  std::string line;
};

class Trimmer {
 public:
  Trimmer(std::FILE* stream, const std::string& trace, const std::string& file, const FilterArguments& arguments)
      : out(stream),
        reader(trace),
        filter(arguments, reader),
        sensors(arguments.sensors.begin(), arguments.sensors.end()),
        isFailedOnly(arguments.failed) {
    if (!arguments.sessions.empty() || arguments.failed) sensors = sensorsOf(trace, arguments);
    requireEmpty(file);
    if (!file.empty()) target.emplace(file, kOwnerAlone, NewFile::Rest::removed);
    reader.listen([this](size_t, const Json& aside) { takeAside(aside); });
  }

  void run() {
    try {
      while (const auto call = reader.next()) take(*call);
    } catch (const InputError& error) {
      throw InputError(reader.position() + ": " + error.what());
    }
    if (isRecording) write("{\"end\":" + std::to_string(calls) + ",\"lost\":0}\n");
    if (target) target->commit();
  }

 private:
  void takeAside(const Json& aside) {
    if (json_object_get(aside.get(), member::kEnd) != nullptr) return;  // it has an end of its own
    if (isRelease(aside) && !isOfKeptList(aside)) return;
    if (json_object_get(aside.get(), member::kFormat) != nullptr) isRecording = true;
    write(reader.line());
  }

  // NULL and what no call gave are nobody's.
  bool isOfKeptList(const Json& release) const {
    const int64_t list = releasedList(release).value_or(0);
    return list == 0 || keptLists.contains(list);
  }

  void take(const TraceCall& call) {
    const bool isWanted = filter.takes(call);
    const Sensor* sensor = filter.sensor();
    const bool hasSensor = call.kind != CallKind::uninit;
    if (hasSensor && sensor == nullptr) throw InputError("no session \"" + call.session + "\" is open");
    if (!isConcerned(sensor) || filter.isBehind()) return;
    const bool isBefore = !filter.isWithin();
    if (!isBefore) writeCarried();
    if (isBefore && !isFailedOnly) carry(call, sensor);
    if (call.engine) engine = {recordField<uint64_t>(filter.record(), kTimestampOffset), engineOfLine()};
    if (call.kind == CallKind::dispatch && !isWanted) return;
    if (call.kind == CallKind::dispatch && sensor->items == Items::samples) return writeGesture(call);
    if (call.list != 0) keptLists.insert(call.list);
    const bool isResumed =
        call.kind == CallKind::open && isBefore && call.recorded != nullptr && filter.takes(call.session, sensor);
    writeCall(isResumed ? changed([](const Json& line) { addMember(line, member::kResumed, Json(json_integer(1))); })
                        : std::string(reader.line()));
  }

  // Keeps what a session has gathered for its next result, which the part begins in the middle of.
  void carry(const TraceCall& call, const Sensor* sensor) {
    if (sensor == nullptr) return;
    const model::Judging judging = model::rowOf(model::kindNamed(sensor->name)).judging;
    if (judging != model::Judging::activity && judging != model::Judging::gathering) return;
    const json_t* returned = json_object_get(call.recorded.get(), member::kReturned);
    const bool isDispatch = call.kind == CallKind::dispatch;
    // With a negotiation, all activity sessions start over.
    const bool hasNegotiated = json_object_get(call.recorded.get(), member::kProperties) != nullptr;
    const bool isRestart = hasNegotiated && judging == model::Judging::activity;
    const bool isFinished = call.kind == CallKind::close || (isDispatch && json_integer_value(returned) == 1);
    if (isRestart || isFinished || carried.size() > kMostCarried) {
      std::erase_if(carried,
                    [&](const Carried& one) { return isRestart ? one.sensor == sensor : one.session == call.session; });
    } else if (isDispatch && call.recorded != nullptr && filter.takes(call.session, sensor)) {
      carried.push_back({call.session, sensor, changed([](const Json& line) {
                           json_object_del(line.get(), member::kReturned);
                           json_object_del(line.get(), member::kResult);
                         })});
    }
  }

  // The gesture engine is asked about a record once, whatever the number of its sessions. What it answered stays with
  // the first of them that is kept.
  void writeGesture(const TraceCall& call) {
    const bool isFirst =
        engine.answers != nullptr && engine.timestamp == recordField<uint64_t>(filter.record(), kTimestampOffset);
    Json answers = isFirst ? std::move(engine.answers) : nullptr;
    writeCall(call.engine || answers == nullptr ? std::string(reader.line()) : changed([&](const Json& line) {
      addMember(line, member::kEngine, std::move(answers));
    }));
  }

  Json engineOfLine() const {
    const Json object(json_loadb(reader.line().data(), reader.line().size(), 0, nullptr));
    return Json(json_incref(json_object_get(object.get(), member::kEngine)));
  }

  void writeCarried() {
    for (const Carried& one : carried) writeCall(one.line);
    carried.clear();
  }

  // What is no sensor's concerns all.
  bool isConcerned(const Sensor* sensor) const {
    return sensor == nullptr || sensors.empty() || sensors.count(sensor->name) != 0;
  }

  // The line that was read last, as a function changes it.
  std::string changed(const std::function<void(const Json& line)>& change) const {
    const Json object(json_loadb(reader.line().data(), reader.line().size(), 0, nullptr));
    change(object);
    return compactText(object.get()) + '\n';
  }

  void writeCall(std::string_view line) {
    ++calls;
    write(line);
  }

  void write(std::string_view line) {
    const bool isWhole = line.ends_with('\n');
    if (target) {
      target->write(line);
      if (!isWhole) target->write("\n");
    } else {
      std::fwrite(line.data(), 1, line.size(), out);
      if (!isWhole) std::fputc('\n', out);
    }
  }

  std::FILE* out;
  TraceReader reader;
  RecordedCalls filter;
  std::set<std::string> sensors;  // concerned; empty: all
  const bool isFailedOnly;        // what a record is refused for has nothing to do with those before it
  std::optional<NewFile> target;
  std::unordered_set<int64_t> keptLists;  // by their numbers
  std::vector<Carried> carried;
  struct {
    std::optional<uint64_t> timestamp;
    Json answers;  // null: they are written
  } engine;        // what it answered last, and for which record
  bool isRecording = false;
  size_t calls = 0;
};

}  // namespace

void trim(std::FILE* out, const std::string& trace, const std::string& file, const FilterArguments& filter) {
  Trimmer(out, trace, file, filter).run();
}

}  // namespace senseloom::tool
