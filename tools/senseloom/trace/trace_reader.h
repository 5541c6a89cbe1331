#pragma once

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <memory>
#include <optional>
#include <string>

#include "trace/json.h"
#include "trace/trace_call.h"

namespace senseloom::tool {

// Reads a trace, JSON Lines with one call a line, a line at a time. Blank lines are skipped, and so are lines with a
// "note" in place of a call.
class TraceReader {
 public:
  // "-" is standard input. Throws InputError when the file cannot be opened.
  explicit TraceReader(const std::string& file);

  // The next call, or nothing at the end. Throws InputError when there is none on a line that is not blank.
  std::optional<TraceCall> next();

  // How long a unit of the timestamps is, in nanoseconds, if a note so far says so.
  std::optional<int64_t> timeUnit() const { return unit; }

  // Where the last line was read, for messages: "FILE:LINE", or the file alone before the first one.
  std::string position() const;

  // The file, for messages.
  const std::string& fileName() const { return name; }

  uint64_t bytesRead() const { return byteCount; }
  // Bytes of the whole trace; 0 when it is not a file.
  uint64_t size() const;

 private:
  struct Close {
    void operator()(std::FILE* file) const;
  };
  struct Free {
    void operator()(char* text) const;
  };

  Json nextObject();
  void readNote(const Json& note);
  bool readLine();

  std::string name;
  std::unique_ptr<std::FILE, Close> stream;
  std::unique_ptr<char, Free> buffer;
  size_t bufferSize = 0;
  size_t lineLength = 0;
  size_t lineNumber = 0;
  uint64_t byteCount = 0;
  std::optional<int64_t> unit;
};

}  // namespace senseloom::tool
