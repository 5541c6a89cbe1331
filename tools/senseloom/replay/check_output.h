#pragma once

#include <cstddef>
#include <cstdio>
#include <limits>
#include <map>
#include <string>

#include "trace/json.h"
#include "trace/replayer.h"
#include "trace/trace_reader.h"

namespace senseloom::tool {

// What is printed of a check.
struct CheckForm {
  bool json = false;                                 // an object a difference, and nothing else
  size_t most = std::numeric_limits<size_t>::max();  // differing calls that are printed
};

// Compares the outcome of each call with the recorded one, and prints the differences. At the end it prints the number
// of calls compared, or throws std::runtime_error with the number of those that differ, or if there was nothing to
// compare.
//
// A session that was open before its recording may have been in the middle of a batch. What its records give is
// compared from the first result on that is as recorded, or from when the session starts over.
class CheckOutput final : public ReplayObserver {
 public:
  CheckOutput(std::FILE* stream, const CheckForm& checkForm, const TraceReader& reader)
      : out(stream), form(checkForm), trace(reader) {}
  void onOutcome(const CallOutcome& outcome) override;
  void onEnd() override;

 private:
  bool isInMiddle(const CallOutcome& outcome, bool isAsRecorded);

  void printDifference(const CallOutcome& outcome, const json_t* actual);

  std::FILE* out;
  const CheckForm form;
  const TraceReader& trace;
  size_t compared = 0;
  size_t different = 0;
  size_t unrecorded = 0;
  size_t inMiddle = 0;
  bool hasEngine = false;                        // the recording holds what the gesture engine answered
  std::map<std::string, const Sensor*> resumed;  // sessions that may still be in the middle of a batch
};

}  // namespace senseloom::tool
