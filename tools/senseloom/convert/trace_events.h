#pragma once

#include <cstdint>
#include <functional>
#include <list>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "convert/trace_converter.h"
#include "plot/record_hues.h"
#include "terminal/output_sink.h"
#include "trace/json.h"
#include "trace/record_joiner.h"

namespace senseloom::tool {

// Writes trace events as JSON, the form that viewers of system traces open: a process for each sensor, with a track for
// its records and one for each session. Slices are sessions that are open and classes that hold; instants are records
// and results that do not last, refusals and negotiations; counters are the items in a batch. Source of the form: the
// document "Trace Event Format".
class TraceEvents final : public TraceConverter {
 public:
  explicit TraceEvents(OutputSink& output);
  void add(const ConvertedCall& converted) override;
  void end() override;

 private:
  struct Held {
    std::string name;
    int64_t since;  // in nanoseconds
  };
  struct Track {
    const Sensor* sensor;
    std::optional<std::string> session;  // nothing: the records of the sensor
    int process;
    int thread;
    std::optional<int64_t> openSince = std::nullopt;
    std::optional<Held> held = std::nullopt;
    bool hasBatch = false;  // what is in its batch is counted
  };

  void dispatch(const ConvertedCall& converted);
  // What a record or a result shows, on a track: from then on, or at that time.
  void show(Track& track, const RecordHues& content);
  void noteCall(const ConvertedCall& converted);
  void finish(Track& track, bool isClosed);
  Track& trackOf(const Sensor* sensor, const std::optional<std::string>& session);
  // Names a process or a thread.
  void describe(const char* what, const Track& track, const std::string& name);
  void write(const char* phase, const char* category, const Track& track, const std::string& name, int64_t at,
             Json more);
  void writeObject(const Json& object);

  OutputSink& sink;
  std::list<Track> tracks;  // references to them stay valid
  int processes = 0;
  RecordJoiner joiner;
  int64_t now = 0;  // the time of the last record, in nanoseconds
  bool isFirst = true;
  // Calls other than dispatches have no time of their own: theirs is that of the next record.
  std::vector<std::function<void()>> waiting;
};

}  // namespace senseloom::tool
