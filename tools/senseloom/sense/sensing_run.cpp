#include "sense/sensing_run.h"

#include <algorithm>
#include <utility>

#include "input_error.h"
#include "plot/picture_file.h"
#include "plot/svg_picture.h"
#include "trace/class_names.h"
#include "trace/hex.h"
#include "trace/record_codec.h"
#include "trace/time_unit.h"
#include "trace/trace_form.h"

namespace senseloom::tool {
namespace {

constexpr char kClose[] = "close";

// By its fields, if they say all that it holds.
Json recordJson(const Sensor& sensor, const hub::Record& record) {
  const bool isWhole = sensor.items != Items::samples && sensor.bytesProperty < 0;
  if (isWhole) return decodeRecord(sensor, record.bytes);
  Json bytes(json_object());
  addMember(bytes, member::kHex, textJson(toHex(record.bytes)));
  return bytes;
}

// Its classes are what labels mean.
bool hasActivities(const Sensor& sensor) {
  return sensor.name == std::string_view("PHYAC") || sensor.name == std::string_view("ISACT");
}

Json callLine(CallKind kind) {
  Json line(json_object());
  addMember(line, member::kCall, textJson(callName(kind)));
  return line;
}

}  // namespace

SensingRun::SensingRun(Write toTrace, const SensingArguments& given)
    : writeLine(std::move(toTrace)), arguments(given), replayer(*this) {
  if (arguments.plot.file.empty()) return;
  requireWritable(arguments.plot.file, arguments.recordings);
  plot.emplace();
}

void SensingRun::run(const std::vector<MotionRecording::Row>& rows) {
  start();
  auto changes = arguments.changes;
  std::ranges::stable_sort(changes, {}, &SensingChange::after);
  auto next = changes.begin();
  for (const MotionRecording::Row& row : rows) {
    const int64_t after = row.sample.time - rows.front().sample.time;
    for (; next != changes.end() && next->after <= after; ++next) change(*next);
    for (const hub::Record& record : hub.take(row.sample)) dispatch(record, row.label);
  }
  for (const hub::Record& record : hub.finish()) dispatch(record, rows.back().label);
  if (next != changes.end()) throw InputError("--at: the recording ends before the time for \"" + next->session + '"');
  while (!open.empty()) close(open.front());
  if (!plot) return;
  const ClassNames names =
      arguments.plot.classNames.empty() ? namesOfClasses() : readClassNames(arguments.plot.classNames);
  writePicture(arguments.plot.file, drawSvg(*plot, {.title = traceTitle(arguments.recordings.front()),
                                                    .classNames = names,
                                                    .timeUnit = kMillisecond}));
}

void SensingRun::start() {
  Json line(json_object());
  std::string sources;
  for (const std::string& recording : arguments.recordings) sources += (sources.empty() ? "" : ", ") + recording;
  addMember(line, member::kNote, textJson("sensed from " + sources));
  addMember(line, member::kTimeUnit, textJson("ms"));
  Json names(json_array());
  for (const std::string& name : namesOfClasses()) json_array_append_new(names.get(), textJson(name).release());
  if (json_array_size(names.get()) > 0) addMember(line, member::kClassNames, std::move(names));
  write(line);
  for (const SensingClient& client : arguments.clients) {
    Json opening = callLine(CallKind::open);
    addMember(opening, member::kSession, textJson(client.name));
    addMember(opening, member::kSensor, textJson(client.sensor->name));
    TraceCall call;
    call.kind = CallKind::open;
    call.session = client.name;
    call.sensor = client.sensor;
    perform(std::move(call), opening);
    open.push_back(client.name);
    setOption(client.name, client.option);
  }
}

// Those of activities, unless there are sensors with other classes, too.
ClassNames SensingRun::namesOfClasses() const {
  const bool areActivities =
      std::ranges::all_of(arguments.clients, [](const SensingClient& client) { return hasActivities(*client.sensor); });
  return areActivities ? ClassNames{"unknown", "still", "on foot", "running"} : ClassNames{};
}

void SensingRun::change(const SensingChange& wanted) {
  if (wanted.option == kClose) {
    close(wanted.session);
  } else {
    setOption(wanted.session, wanted.option);
  }
}

void SensingRun::setOption(const std::string& session, const std::string& option) {
  Json line = callLine(CallKind::setOption);
  addMember(line, member::kSession, textJson(session));
  Json object(json_loads(option.c_str(), 0, nullptr));
  addMember(line, member::kOption, json_is_object(object.get()) ? std::move(object) : textJson(option));
  TraceCall call;
  call.kind = CallKind::setOption;
  call.session = session;
  call.option = option;
  perform(std::move(call), line);
}

void SensingRun::close(const std::string& session) {
  Json line = callLine(CallKind::close);
  addMember(line, member::kSession, textJson(session));
  TraceCall call;
  call.kind = CallKind::close;
  call.session = session;
  perform(std::move(call), line);
  std::erase(open, session);
}

void SensingRun::dispatch(const hub::Record& record, int32_t label) {
  const Sensor& sensor = sensorNamed(std::string(record.sensor));
  TraceCall call;
  call.kind = CallKind::dispatch;
  call.sensor = &sensor;
  call.record = recordJson(sensor, record);
  Json line = callLine(CallKind::dispatch);
  addMember(line, member::kSensor, textJson(sensor.name));
  addMember(line, member::kRecord, Json(json_incref(call.record.get())));
  const auto known = arguments.labels.find(label);
  const int32_t truth = known == arguments.labels.end() ? label : known->second;
  if (hasActivities(sensor) && truth != 0) addMember(line, member::kTruth, Json(json_integer(truth)));
  perform(std::move(call), line);
}

void SensingRun::write(const Json& line) {
  writeLine(compactText(line.get()) + '\n');
  ++lines;
}

void SensingRun::perform(TraceCall call, const Json& line) {
  write(line);
  call.line = lines;
  replayer.perform(call);
}

void SensingRun::onOutcome(const CallOutcome& outcome) {
  if (outcome.call.kind == CallKind::setOption && outcome.failed) {
    throw InputError("the library refuses the option of session \"" + outcome.session +
                     "\": " + outcome.call.option.value_or(""));
  }
  if (outcome.call.kind == CallKind::close && outcome.returned == 0) hub.stop(outcome.sensor->name);
  if (outcome.properties) {
    std::vector<hub::Property> list;
    for (const Property& property : *outcome.properties) list.push_back({.id = property.id, .value = property.value});
    try {
      hub.configure(outcome.sensor->name, list);
    } catch (const hub::Refused& refused) {
      throw InputError("session \"" + outcome.session + "\": " + refused.what());
    }
  }
  if (plot) plot->onOutcome(outcome);
}

}  // namespace senseloom::tool
