#pragma once

#include <cstdint>
#include <memory>
#include <span>
#include <string>
#include <vector>

#include "explain/log_capture.h"
#include "explain/verdict.h"
#include "explain/wishes.h"
#include "trace/record_codec.h"

namespace senseloom::tool {

struct GestureState;

// What one session does with records, told from its wishes and the records alone: beside the library, so that the tool
// can say why, and notices when the library does otherwise.
class SessionModel {
 public:
  virtual ~SessionModel() = default;

  // What becomes of a record. `log` is what the library logged about it.
  virtual Verdict judge(const Wishes& wishes, std::span<const uint8_t> record, const std::vector<LogLine>& log) = 0;

  // The sensor negotiated, and the session starts over. `leastLogM` is the merged "logM" of the activity sensor, and 0
  // for others.
  virtual void restart(const Wishes& /*wishes*/, int32_t /*leastLogM*/) {}

  // The stages that records go through; empty when there are none.
  virtual std::string chain() const { return {}; }
  // What else there is to tell of the records so far; empty for nothing.
  virtual std::string account() const { return {}; }
};

// `gestures` is what all sessions of hand-drawn gestures share.
std::unique_ptr<SessionModel> makeSessionModel(const RecordLayout& sensor, GestureState& gestures);

}  // namespace senseloom::tool
