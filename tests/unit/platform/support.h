// What the tests of the platform's libraries share.
#pragma once

#include <optional>
#include <ostream>
#include <string>
#include <vector>

// An environment variable that has another value, or none (nullptr), for as long as the object lives.
class ScopedVariable {
 public:
  ScopedVariable(const char* variable, const char* value);
  ~ScopedVariable();
  ScopedVariable(const ScopedVariable&) = delete;
  ScopedVariable& operator=(const ScopedVariable&) = delete;

 private:
  const std::string name;
  std::optional<std::string> before;
};

struct LogLine {
  int priority;
  std::string tag;
  std::string text;

  bool operator==(const LogLine&) const = default;
  friend std::ostream& operator<<(std::ostream& out, const LogLine& line) {
    return out << line.priority << ' ' << line.tag << " \"" << line.text << '"';
  }
};

// Collects what is logged at any priority for as long as the object lives, of which there is one at a time.
class ScopedLog {
 public:
  ScopedLog();
  ~ScopedLog();
  ScopedLog(const ScopedLog&) = delete;
  ScopedLog& operator=(const ScopedLog&) = delete;

  // The lines since the last call.
  std::vector<LogLine> take();

 private:
  const int minimumBefore;
};
