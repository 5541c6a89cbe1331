#pragma once

#include <string>
#include <vector>

namespace senseloom::model {

inline constexpr int kDebug = 3;
inline constexpr int kInfo = 4;
inline constexpr int kError = 6;
inline constexpr const char* kTag = "libsenseloom";

struct LogLine {
  int priority;
  std::string tag;
  std::string text;
  bool operator==(const LogLine&) const = default;
};
using Log = std::vector<LogLine>;

// Adds a line. Returns its text, which stays where it is until the next line.
const std::string& write(Log& log, int priority, const char* tag, const char* format, ...)
    __attribute__((format(printf, 4, 5)));

}  // namespace senseloom::model
