#pragma once

#include <cstdint>

#include "bytes.h"
#include "outcome.h"
#include "reasons.h"

namespace senseloom::model {

// What all sessions of hand-drawn gestures share: the engine, and what it recognised in the last record, so that a
// record which several of them get is recognised once.
class Gestures {
 public:
  void sessionOpened(const Answers& answers, Outcome& outcome);
  void sessionClosed(Outcome& outcome);
  Verdict judge(int32_t classMask, Record record, const Answers& answers, Outcome& outcome);

  bool operator==(const Gestures&) const = default;

 private:
  void recognise(Record record, const Answers& answers, Outcome& outcome);

  int sessions = 0;
  uint64_t timestamp = 0;  // of the last record
  int classNumber = 0;     // recognised in it; 0: none
};

}  // namespace senseloom::model
