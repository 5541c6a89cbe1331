#pragma once

#include <string>
#include <vector>

namespace senseloom::tool {

struct LogLine {
  int priority;
  std::string tag;
  std::string text;  // without a line end
};

// Takes the log lines of the process instead of having them printed, for as long as it lives. There is one at a time.
class LogCapture {
 public:
  LogCapture();
  ~LogCapture();
  LogCapture(const LogCapture&) = delete;
  LogCapture& operator=(const LogCapture&) = delete;

  // The lines logged since the last call.
  std::vector<LogLine> take();

 private:
  const int priorityBefore;
};

}  // namespace senseloom::tool
