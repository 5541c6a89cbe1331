#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "trace/replayer.h"
#include "trace/trace_reader.h"
#include "trace/trace_time.h"

namespace senseloom::tool {

// Which calls a user wants to see.
struct FilterArguments {
  std::vector<std::string> sessions = {};  // any of them; empty: all
  std::vector<std::string> sensors = {};
  std::string from = {};  // a line of the trace, or a time since its start such as "5s"; empty: its first call
  std::string to = {};
  bool failed = false;        // only calls that failed
  std::string timeUnit = {};  // of timestamps; empty: as the trace says

  bool takesAll() const;
  // In nanoseconds; nothing: as the trace says.
  std::optional<int64_t> unit() const;
};

// Tells which calls are to be shown. All calls of a trace are passed to it, in order.
class CallFilter {
 public:
  // Throws InputError when there is no such sensor, or an end is neither a line nor a time.
  static void check(const FilterArguments& arguments);
  // Throws as check().
  CallFilter(const FilterArguments& filterArguments, const TraceReader& trace);

  // Throws InputError when an end is a time and the trace does not tell any.
  bool takes(const CallOutcome& outcome);
  // Whether a call that was passed is between the ends, and behind the second one.
  bool isWithin(const CallOutcome& outcome) const { return compare(outcome, from) >= 0 && !isBehind(outcome); }
  bool isBehind(const CallOutcome& outcome) const { return compare(outcome, to) > 0; }
  // Whether it may take calls of a session, whenever they are.
  bool takes(const std::string& session, const Sensor* sensor) const;

 private:
  struct End {
    std::optional<size_t> line;
    std::optional<int64_t> time;  // in nanoseconds
  };
  static End readEnd(const std::string& text);
  // Below 0: the call is before the end; above: behind it.
  int64_t compare(const CallOutcome& outcome, const End& end) const;

  FilterArguments arguments;
  End from;
  End to;
  TraceTime time;
};

// Passes on what a filter takes. An output without a filter is returned as it is.
std::unique_ptr<ReplayObserver> withFilter(std::unique_ptr<ReplayObserver> output, const FilterArguments& arguments,
                                           const TraceReader& trace);

}  // namespace senseloom::tool
