#pragma once

#include "explain/session_model.h"

namespace senseloom::tool {

// What the sessions of hand-drawn gestures share: a record that several of them get is recognised once.
struct GestureState {
  uint64_t timestamp = 0;   // of the last record that was recognised
  int32_t classNumber = 0;  // found in it; 0: none
};

// Hand-drawn gestures. What the gesture engine found in a record is taken from the library's log.
class GestureModel final : public SessionModel {
 public:
  explicit GestureModel(GestureState& gestures) : state(gestures) {}
  Verdict judge(const Wishes& wishes, std::span<const uint8_t> record, const std::vector<LogLine>& log) override;

 private:
  GestureState& state;
};

}  // namespace senseloom::tool
