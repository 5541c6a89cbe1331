#include "info/trace_info.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <map>
#include <optional>
#include <utility>
#include <vector>

#include "info/list_leaks.h"
#include "input_error.h"
#include "terminal/text_table.h"
#include "trace/json.h"
#include "trace/record_field.h"
#include "trace/recorded_calls.h"
#include "trace/time_unit.h"
#include "trace/trace_reader.h"
#include "trace/trace_time.h"

namespace senseloom::tool {
namespace {

struct SensorCounts {
  size_t sessions = 0;
  size_t options = 0;
  size_t records = 0;
};

struct OpenSession {
  const Sensor* sensor;
  size_t line;
  bool isShown = false;  // one of its calls is wanted
};

// What is told of a trace, as (name, text), for people and for programs alike.
using Fact = std::pair<std::string, std::string>;

class TraceInfo {
 public:
  TraceInfo(const std::string& file, const FilterArguments& arguments)
      : reader(file, [this](const std::string& remark) { remarks.push_back(remark); }),
        shown(arguments),
        filter(arguments, reader) {
    reader.listen([this](size_t line, const Json& aside) { takeAside(line, aside); });
    try {
      while (const auto call = reader.next()) take(*call);
    } catch (const InputError& error) {
      throw InputError(reader.position() + ": " + error.what());
    }
    filter.requireOutcomes();
    std::erase_if(open, [](const auto& session) { return !session.second.isShown; });
    for (const std::string& wrong : lists.wrongReleases()) remarks.push_back(reader.fileName() + ':' + wrong);
  }

  void print(std::FILE* out) const {
    for (const auto& [name, text] : facts()) std::fprintf(out, "%s: %s\n", name.c_str(), text.c_str());
    std::vector<TextRow> rows{{"sensor", "sessions", "options", "records"}};
    for (const auto& [sensor, counts] : sensors) {
      rows.push_back({sensor->name, std::to_string(counts.sessions), std::to_string(counts.options),
                      std::to_string(counts.records)});
    }
    printTable(out, rows, 1);
    for (const std::string& remark : remarks) std::fprintf(out, "%s\n", remark.c_str());
    for (const auto& [name, session] : open) {
      std::fprintf(out, "leak: session \"%s\" on %s, opened on line %zu, is never closed\n", name.c_str(),
                   session.sensor->name, session.line);
    }
    for (const std::string& leak : lists.texts()) std::fprintf(out, "leak: %s\n", leak.c_str());
  }

  void printJson(std::FILE* out) const {
    Json object(json_object());
    for (const auto& [name, text] : facts()) addMember(object, name.c_str(), Json(json_string(text.c_str())));
    Json list(json_array());
    for (const auto& [sensor, counts] : sensors) {
      json_array_append_new(list.get(),
                            json_pack("{s:s,s:I,s:I,s:I}", "sensor", sensor->name, "sessions", number(counts.sessions),
                                      "options", number(counts.options), "records", number(counts.records)));
    }
    addMember(object, "sensors", std::move(list));
    Json told(json_array());
    for (const std::string& remark : remarks) json_array_append_new(told.get(), json_string(remark.c_str()));
    addMember(object, "remarks", std::move(told));
    Json leaks(json_array());
    for (const auto& [name, session] : open) {
      json_array_append_new(leaks.get(), json_pack("{s:s,s:s,s:I}", "session", name.c_str(), "sensor",
                                                   session.sensor->name, "line", number(session.line)));
    }
    addMember(object, "leaks", std::move(leaks));
    if (Json listLeaks = lists.json()) addMember(object, "listLeaks", std::move(listLeaks));
    std::fprintf(out, "%s\n", compactText(object.get()).c_str());
  }

 private:
  static json_int_t number(size_t count) { return static_cast<json_int_t>(count); }

  void takeAside(size_t line, const Json& aside) {
    if (isRelease(aside)) {
      lists.takeRelease(line, aside);
    } else if (isNote(aside)) {
      ++notes;
    } else if (json_object_get(aside.get(), member::kFormat) != nullptr) {
      head.reset(json_incref(aside.get()));
    }
  }

  void take(const TraceCall& call) {
    const bool isWanted = filter.takes(call);
    if (call.kind == CallKind::open) takeOpen(call);
    if (isWanted) count(call);
    if (call.kind == CallKind::close) open.erase(call.session);
  }

  void takeOpen(const TraceCall& call) {
    const json_t* returned = json_object_get(call.recorded.get(), member::kReturned);
    if (!json_is_null(returned)) open[call.session] = {call.sensor, call.line};
  }

  void count(const TraceCall& call) {
    ++calls[static_cast<size_t>(call.kind)];
    lists.take(call);
    if (call.atMicroseconds) {
      if (!firstMicroseconds) firstMicroseconds = call.atMicroseconds;
      lastMicroseconds = call.atMicroseconds;
    }
    if (call.kind == CallKind::dispatch && call.session.empty()) {
      for (auto& [name, session] : open) {
        if (session.sensor == call.sensor && filter.takes(name, session.sensor)) show(session);
      }
    } else if (call.kind != CallKind::uninit) {
      const auto session = open.find(call.session);
      if (session == open.end()) return;  // one that did not open
      show(session->second);
    }
    if (call.kind == CallKind::setOption) ++sensors[filter.sensor()].options;
    if (call.kind == CallKind::dispatch) takeRecord(*filter.sensor());
  }

  void show(OpenSession& session) {
    if (!std::exchange(session.isShown, true)) ++sensors[session.sensor].sessions;
  }

  void takeRecord(const Sensor& sensor) {
    ++sensors[&sensor].records;
    const auto timestamp = recordField<uint64_t>(filter.record(), kTimestampOffset);
    if (!timestamp) return;
    if (!firstTimestamp) firstTimestamp = timestamp;
    lastTimestamp = timestamp;
  }

  std::vector<Fact> facts() const {
    std::vector<Fact> list{{"trace", reader.fileName()}};
    for (const char* key : {member::kProgram, member::kProcess, member::kBits, member::kLibrary, member::kTool,
                            member::kStarted, member::kPart}) {
      const json_t* value = json_object_get(head.get(), key);
      if (json_is_string(value)) list.emplace_back(key, json_string_value(value));
      if (json_is_integer(value)) list.emplace_back(key, std::to_string(json_integer_value(value)));
    }
    std::string text;
    for (const CallKind kind : kAllCalls) {
      const size_t count = calls[static_cast<size_t>(kind)];
      if (count > 0) text += (text.empty() ? "" : ", ") + std::to_string(count) + ' ' + callName(kind);
    }
    list.emplace_back("calls", text.empty() ? "none" : text);
    if (const std::string counts = lists.counts(); !counts.empty()) list.emplace_back("lists", counts);
    if (notes > 0 && shown.takesAll()) list.emplace_back("notes", std::to_string(notes));
    if (firstTimestamp) {
      list.emplace_back("timestamps", std::to_string(*firstTimestamp) + " to " + std::to_string(*lastTimestamp));
    }
    if (const auto length = duration()) list.emplace_back("duration", elapsedText(*length));
    return list;
  }

  std::optional<int64_t> duration() const {
    // A recording as a whole began before its first call.
    if (lastMicroseconds) return (*lastMicroseconds - (shown.takesAll() ? 0 : *firstMicroseconds)) * 1000;
    const auto unit = shown.unit() ? shown.unit() : reader.timeUnit();
    if (!unit || !firstTimestamp || *lastTimestamp < *firstTimestamp) return std::nullopt;
    return timeOf(*lastTimestamp - *firstTimestamp, *unit);
  }

  std::vector<std::string> remarks;
  TraceReader reader;
  const FilterArguments shown;
  RecordedCalls filter;
  Json head;
  std::array<size_t, kAllCalls.size()> calls{};
  size_t notes = 0;
  std::map<const Sensor*, SensorCounts> sensors;  // in the order of the tool's table
  std::map<std::string, OpenSession> open;
  ListLeaks lists;
  std::optional<uint64_t> firstTimestamp;
  std::optional<uint64_t> lastTimestamp;
  std::optional<int64_t> firstMicroseconds;
  std::optional<int64_t> lastMicroseconds;
};

}  // namespace

void printInfo(std::FILE* out, const std::string& trace, const FilterArguments& filter, bool json) {
  const TraceInfo info(trace, filter);
  if (json) {
    info.printJson(out);
  } else {
    info.print(out);
  }
}

}  // namespace senseloom::tool
