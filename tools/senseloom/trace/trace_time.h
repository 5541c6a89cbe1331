#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "trace/replayer.h"
#include "trace/trace_reader.h"

namespace senseloom::tool {

// When the calls of a trace were made, as far as it tells: a recording says so for each call, any other trace by the
// timestamps of its records, whose unit must be known.
class TraceTime {
 public:
  // `givenUnit`: of timestamps, in nanoseconds; nothing: as the trace says.
  TraceTime(const TraceReader& reader, std::optional<int64_t> givenUnit) : trace(reader), unit(givenUnit) {}

  // Goes on to a call.
  void pass(const CallOutcome& outcome);

  // Of the last call, in nanoseconds; nothing where the trace does not tell.
  std::optional<int64_t> sinceStart() const { return elapsed; }
  std::optional<int64_t> since1970() const { return wall; }

 private:
  const TraceReader& trace;
  std::optional<int64_t> unit;
  std::optional<uint64_t> firstTimestamp;
  std::optional<int64_t> elapsed;
  std::optional<int64_t> wall;
};

// "1:02:03.456"
std::string elapsedText(int64_t nanoseconds);
// "2026-11-21 21:31:57.064", in UTC.
std::string clockText(int64_t nanoseconds);
// What clockText() writes, and "2026-11-21T21:31:57.064729Z", in nanoseconds since 1970; nothing if it is no such text.
std::optional<int64_t> clockFromText(const std::string& text);

}  // namespace senseloom::tool
