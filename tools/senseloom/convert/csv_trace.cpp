#include "convert/csv_trace.h"

#include <sys/stat.h>

#include <algorithm>
#include <cerrno>
#include <charconv>
#include <cstring>
#include <limits>
#include <optional>
#include <utility>

#include "input_error.h"
#include "terminal/interrupt.h"
#include "terminal/output_sink.h"
#include "trace/json.h"
#include "trace/record_codec.h"
#include "trace/time_unit.h"
#include "trace/trace_form.h"

namespace senseloom::tool {
namespace {

constexpr int64_t kSequences = 2048;  // numbers that a decision can have, from 0 on

Json integer(int64_t value) {
  return Json(json_integer(value));
}

int32_t numberFrom(const std::string& text, const std::string& column) {
  int32_t number = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
  if (error != std::errc() || end != text.data() + text.size()) {
    throw InputError("column \"" + column + "\": \"" + text + "\" is not the number of a class");
  }
  return number;
}

void print(OutputSink& out, const Json& object) {
  out.write(compactText(object.get()) + '\n');
}

// The file name of a recording's trace. Nothing that leads out of the folder.
std::string fileOf(const std::string& recording) {
  constexpr char kAllowed[] = "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789_-";
  if (recording.empty() || recording.find_first_not_of(kAllowed) != std::string::npos) {
    throw InputError("\"" + recording + "\" cannot name a file: only letters, digits, _ and - can");
  }
  return recording + ".jsonl";
}

// Writes one trace. Timestamps are in milliseconds, unless those of the table are in a shorter unit.
class TraceOfRows {
 public:
  TraceOfRows(OutputSink& sink, const Sensor& records, int64_t tableUnit)
      : out(sink), sensor(records), unit(std::min(tableUnit, kMillisecond)) {
    Json note(json_object());
    addMember(note, member::kNote, Json(json_string("decisions from a table")));
    addMember(note, member::kTimeUnit, Json(json_string(timeUnitName(unit).c_str())));
    print(out, note);
  }

  void add(int64_t time, int32_t classNumber, int32_t truth) {
    if (time < lastTime) throw InputError("the time is before that of the row above");
    lastTime = time;
    Json record(json_object());
    addMember(record, member::kTimestamp, integer((time + unit / 2) / unit));
    if (sensor.items == Items::decisions) {
      Json decision(json_object());
      addMember(decision, member::kClass, integer(classNumber));
      addMember(decision, member::kSequence, integer(rows++ % kSequences));
      Json items(json_array());
      json_array_append_new(items.get(), decision.release());
      addMember(record, member::kItems, std::move(items));
    } else {
      addMember(record, sensor.value, integer(classNumber));
    }
    encodeRecord(sensor, record.get());  // throws if a record cannot hold the class

    Json call(json_object());
    addMember(call, member::kCall, Json(json_string(callName(CallKind::dispatch))));
    addMember(call, member::kSensor, Json(json_string(sensor.name)));
    addMember(call, member::kRecord, std::move(record));
    if (truth != 0) addMember(call, member::kTruth, integer(truth));
    print(out, call);
  }

 private:
  OutputSink& out;
  const Sensor& sensor;
  const int64_t unit;
  int64_t lastTime = 0;
  int64_t rows = 0;
};

// The places of the columns in a row.
class Places {
 public:
  Places(const std::vector<std::string>& heading, const DecisionColumns& columns)
      : width(heading.size()),
        time(require(heading, columns.time)),
        classNumber(require(heading, columns.classNumber)),
        truth(find(heading, columns.truth)),
        recording(find(heading, columns.recording)) {}

  const size_t width;
  const size_t time;
  const size_t classNumber;
  const std::optional<size_t> truth;
  const std::optional<size_t> recording;

 private:
  static size_t require(const std::vector<std::string>& heading, const std::string& name) {
    const auto found = std::ranges::find(heading, name);
    if (found != heading.end()) return static_cast<size_t>(found - heading.begin());
    std::string all;
    for (const std::string& each : heading) all += (all.empty() ? "" : ", ") + each;
    throw InputError("no column \"" + name + "\" among " + all + ": --columns says which is which");
  }
  static std::optional<size_t> find(const std::vector<std::string>& heading, const std::string& name) {
    if (name.empty()) return std::nullopt;
    return require(heading, name);
  }
};

// Where the rows of the table go. A trace gets its name in the folder when it is complete.
class Traces {
 public:
  Traces(const CsvConversion& wanted, std::FILE* standardOutput) : conversion(wanted), out(standardOutput) {
    if (conversion.folder.empty()) {
      begin("");
    } else if (mkdir(conversion.folder.c_str(), 0777) != 0 && errno != EEXIST) {
      throw InputError(conversion.folder + ": cannot be made: " + std::strerror(errno));
    }
  }

  void add(const std::vector<std::string>& cells, const Places& places) {
    if (cells.size() != places.width) {
      throw InputError(std::to_string(cells.size()) + " cells in a table of " + std::to_string(places.width));
    }
    if (places.recording) select(cells[*places.recording]);
    const DecisionColumns& columns = conversion.columns;
    trace->add(timeFromText(cells[places.time], conversion.timeUnit),
               numberFrom(cells[places.classNumber], columns.classNumber),
               places.truth ? numberFrom(cells[*places.truth], columns.truth) : 0);
  }

  // All rows of the recording are written.
  void end() {
    if (sink) sink->commit();
  }

 private:
  void select(const std::string& recording) {
    if (!recordings.empty() && recording == recordings.back()) return;
    if (std::ranges::find(recordings, recording) != recordings.end()) {
      throw InputError("recording \"" + recording + "\" has other rows further up, with another recording in between");
    }
    end();
    recordings.push_back(recording);
    begin(conversion.folder + '/' + fileOf(recording));
  }

  void begin(const std::string& file) {
    sink.emplace(out, file, conversion.file);
    trace.emplace(*sink, conversion.sensor, conversion.timeUnit);
  }

  const CsvConversion& conversion;
  std::FILE* out;
  std::vector<std::string> recordings;  // so far
  std::optional<OutputSink> sink;
  std::optional<TraceOfRows> trace;
};

}  // namespace

DecisionColumns readColumns(const std::string& text) {
  DecisionColumns columns;
  const std::pair<std::string_view, std::string*> things[] = {{"time", &columns.time},
                                                              {"class", &columns.classNumber},
                                                              {"truth", &columns.truth},
                                                              {"recording", &columns.recording}};
  for (size_t from = 0; from <= text.size();) {
    const size_t to = std::min(text.find(',', from), text.size());
    const std::string part = text.substr(from, to - from);
    from = to + 1;
    const size_t equals = part.find('=');
    const auto* const thing =
        std::ranges::find(things, part.substr(0, equals), &std::pair<std::string_view, std::string*>::first);
    if (thing == std::end(things) || equals == std::string::npos || equals + 1 == part.size()) {
      throw InputError("--columns " + text +
                       ": must be time=NAME,class=NAME,truth=NAME,recording=NAME, or some of these");
    }
    *thing->second = part.substr(equals + 1);
  }
  return columns;
}

void convertCsv(std::FILE* out, const CsvConversion& conversion) {
  const Sensor& sensor = conversion.sensor;
  const bool hasClass = sensor.items == Items::decisions || (sensor.items == Items::none && hasClasses(sensor));
  if (!hasClass) throw InputError(std::string("a record of ") + sensor.name + " is not a class alone");
  if (conversion.columns.recording.empty() != conversion.folder.empty()) {
    throw InputError("--columns recording=NAME and --output FOLDER go together: a trace for each recording");
  }
  const InterruptMark mark;
  CsvReader table(conversion.file);
  try {
    const auto heading = table.next();
    if (heading.empty()) throw InputError("holds no table");
    const Places places(heading, conversion.columns);
    Traces traces(conversion, out);
    for (auto cells = table.next(); !cells.empty(); cells = table.next()) {
      if (isInterrupted()) return;  // the trace of this recording is not complete
      traces.add(cells, places);
    }
    if (!isInterrupted()) traces.end();
  } catch (const InputError& error) {
    throw InputError(table.position() + ": " + error.what());
  }
}

}  // namespace senseloom::tool
