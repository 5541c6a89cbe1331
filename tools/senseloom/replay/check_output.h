#pragma once

#include <cstddef>
#include <cstdio>
#include <map>
#include <string>

#include "trace/replayer.h"
#include "trace/trace_reader.h"

namespace senseloom::tool {

// Compares the outcome of each call with the recorded one, and prints the differences. At the end it prints the number
// of calls compared, or throws std::runtime_error with the number of those that differ, or if there was nothing to
// compare.
//
// A session that was open before its recording may have been in the middle of a batch. What its records give is
// compared from the first result on that is as recorded, or from when the session starts over.
class CheckOutput final : public ReplayObserver {
 public:
  CheckOutput(std::FILE* stream, const TraceReader& reader) : out(stream), trace(reader) {}
  void onOutcome(const CallOutcome& outcome) override;
  void onEnd() override;

 private:
  bool isInMiddle(const CallOutcome& outcome, bool isAsRecorded);

  std::FILE* out;
  const TraceReader& trace;
  size_t compared = 0;
  size_t different = 0;
  size_t unrecorded = 0;
  size_t inMiddle = 0;
  std::map<std::string, const Sensor*> resumed;  // sessions that may still be in the middle of a batch
};

}  // namespace senseloom::tool
