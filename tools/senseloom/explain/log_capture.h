#pragma once

#include "model/log.h"

namespace senseloom::tool {

// Where the lines come from that the library logs.
class LogSource {
 public:
  virtual ~LogSource() = default;
  // The lines logged since the last call.
  virtual model::Log take() = 0;
};

// Takes the log lines of the process instead of having them printed, for as long as it lives. There is one at a time.
class LogCapture final : public LogSource {
 public:
  LogCapture();
  ~LogCapture() override;
  LogCapture(const LogCapture&) = delete;
  LogCapture& operator=(const LogCapture&) = delete;

  model::Log take() override;

 private:
  const int priorityBefore;
};

}  // namespace senseloom::tool
