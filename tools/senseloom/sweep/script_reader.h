#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "sweep/sweep_script.h"
#include "trace/trace_call.h"
#include "trace/trace_reader.h"

namespace senseloom::tool {

// Reads a trace for a sweep. Of the calls on the client's sensor all negotiations are kept, since what others ask for
// counts there: "logM" changes everybody's batches. Dispatches to others are left out, since no session sees another's
// records; but those of the gesture sensor are kept, whose sessions share what was recognised in the last record.
class ScriptReader {
 public:
  // A client that the traces have gets its sensor, if it has none yet. `timeUnit` is that of the timestamps and of the
  // truth file; 0: the trace's, or milliseconds. A truth file stands in for the labels in the trace; empty: these
  // count.
  ScriptReader(SweptClient& sweptClient, std::string truth, int64_t timeUnit)
      : client(sweptClient), truthFile(std::move(truth)), fixedUnit(timeUnit) {}

  // Reads the whole trace. Throws InputError, with the position in the trace.
  SweepScript read(const std::string& file);

 private:
  struct Session {
    const Sensor* sensor;
    size_t client;
    bool failed;  // the trace says that it never opened
  };

  void take(const TraceCall& call);
  void open(const TraceCall& call);
  void setOption(const TraceCall& call);
  void dispatch(const TraceCall& call);
  void close(const TraceCall& call);
  void begin();
  bool isNewRecord(const TraceCall& call, const Sensor& sensor, const std::vector<uint8_t>& bytes);
  void addRecord(const TraceCall& call, const std::vector<uint8_t>& bytes);
  StoredBytes store(const std::vector<uint8_t>& bytes);
  int32_t labelOf(const TraceCall& call) const;
  std::string headOf(const std::optional<std::string>& option) const;
  void addStep(SweepStep step, const Sensor* sensor);
  const Session& require(const std::string& name) const;

  SweptClient& client;
  const std::string truthFile;
  const int64_t fixedUnit;
  int64_t unit = 0;
  SweepScript script;
  std::vector<std::pair<SweepStep, const Sensor*>> steps;  // of all sensors

  std::map<std::string, Session> sessions;  // that are open
  bool isOpen = false;                      // the swept session
  size_t uninits = 0;                       // so far
  size_t openedAfter = 0;                   // so many of them, the swept session was opened
  std::optional<size_t> ownOption;          // the step that stands in for an option which the trace does not set
  bool hasPrevious = false;                 // the last record was in the same opening of the session

  // What reached a sensor last, to recognise a record that a trace has once a session.
  std::string offeredOn;
  std::vector<uint8_t> offered;
  std::set<std::string> offeredTo;
};

}  // namespace senseloom::tool
