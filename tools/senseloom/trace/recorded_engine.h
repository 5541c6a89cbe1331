#pragma once

#include <optional>
#include <vector>

#include "trace/engine_answer.h"

namespace senseloom::tool {

// While there is one, the gesture engine answers what it is given, or goes on as always if that is nothing. An engine
// that cannot be told what to answer goes on as always, too: platform/interfaces/gesture_answers.h.
class RecordedEngine {
 public:
  explicit RecordedEngine(const std::optional<std::vector<EngineAnswer>>& answers);
  ~RecordedEngine();
  RecordedEngine(const RecordedEngine&) = delete;
  RecordedEngine& operator=(const RecordedEngine&) = delete;

 private:
  std::vector<const char*> names;  // by group
};

}  // namespace senseloom::tool
