#pragma once

#include <cstdint>

#include "explain/explanation.h"
#include "trace/replayer.h"

namespace senseloom::tool {

// What a call came to, and why.
struct ConvertedCall {
  const CallOutcome& outcome;
  int64_t timeUnit;                         // of timestamps, in nanoseconds
  const ExplainedCall* call = nullptr;      // null: there is nothing to tell of it
  const ExplainedRecord* record = nullptr;  // of a dispatch
};

// Writes what other programs read, a call at a time.
class TraceConverter {
 public:
  virtual ~TraceConverter() = default;
  virtual void add(const ConvertedCall& converted) = 0;
  virtual void end() = 0;
};

}  // namespace senseloom::tool
