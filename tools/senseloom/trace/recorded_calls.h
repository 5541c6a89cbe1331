#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "trace/call_filter.h"
#include "trace/trace_call.h"
#include "trace/trace_reader.h"

namespace senseloom::tool {

// Tells which calls of a trace a filter takes, for who reads the trace without replaying it. A call has failed if the
// recording says so. What is dispatched to a whole sensor is taken if it is for a session that is open on it.
class RecordedCalls {
 public:
  // Throws InputError as CallFilter does.
  RecordedCalls(const FilterArguments& filterArguments, const TraceReader& traceReader)
      : arguments(filterArguments), trace(traceReader), filter(filterArguments, traceReader) {}

  // Goes on to the next call of the trace, and tells whether the filter takes it.
  bool takes(const TraceCall& call);

  // Of the last call: its sensor, null for uninit and for a session that no call has opened; its record, empty without
  // one; and whether it is between the ends of the filter, or behind the second one.
  const Sensor* sensor() const { return lastSensor; }
  const std::vector<uint8_t>& record() const { return lastRecord; }
  bool isWithin() const { return isLastWithin; }
  bool isBehind() const { return isLastBehind; }
  // Whether the filter may take calls of a session, whenever they are.
  bool takes(const std::string& session, const Sensor* sensor) const { return filter.takes(session, sensor); }

  // For the end of the trace. Throws InputError if failed calls are wanted, and the trace tells of no call whether it
  // failed.
  void requireOutcomes() const;

 private:
  struct Session {
    const Sensor* sensor;
    bool isOpen;
  };
  void noteSession(const TraceCall& call, bool hasFailed);

  const FilterArguments arguments;
  const TraceReader& trace;
  CallFilter filter;
  std::map<std::string, Session> sessions;  // by name, as opened last
  const Sensor* lastSensor = nullptr;
  std::vector<uint8_t> lastRecord;
  bool isLastWithin = true;
  bool isLastBehind = false;
  bool hasCalls = false;
  bool hasOutcomes = false;
};

}  // namespace senseloom::tool
