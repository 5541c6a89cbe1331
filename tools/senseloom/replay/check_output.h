#pragma once

#include <cstddef>
#include <cstdio>

#include "trace/replayer.h"
#include "trace/trace_reader.h"

namespace senseloom::tool {

// Compares the outcome of each call with the recorded one, and prints the differences. At the end it prints the number
// of calls compared, or throws std::runtime_error with the number of those that differ.
class CheckOutput final : public ReplayObserver {
 public:
  CheckOutput(std::FILE* stream, const TraceReader& reader) : out(stream), trace(reader) {}
  void onOutcome(const CallOutcome& outcome) override;
  void onEnd() override;

 private:
  std::FILE* out;
  const TraceReader& trace;
  size_t compared = 0;
  size_t different = 0;
  size_t unrecorded = 0;
};

}  // namespace senseloom::tool
