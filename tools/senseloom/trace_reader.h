#pragma once

#include <cstddef>
#include <cstdio>
#include <memory>
#include <optional>
#include <string>

#include "json.h"
#include "record_codec.h"

namespace senseloom::tool {

enum class CallKind { open, setOption, dispatch, close, uninit };

// The name of a call in traces and in output.
const char* callName(CallKind kind);

// One call of a trace.
struct TraceCall {
  size_t line = 0;
  CallKind kind = CallKind::uninit;
  std::string session;                   // empty for uninit, and for a dispatch to a whole sensor
  const RecordLayout* sensor = nullptr;  // of an open, and of a dispatch to a whole sensor
  std::optional<std::string> option;     // of a set_option; nothing: a null pointer
  Json record;                           // of a dispatch
};

// Reads a trace, JSON Lines with one call a line, a line at a time. Blank lines are skipped; members of a line beyond
// those of its call are ignored, which leaves room for notes.
class TraceReader {
 public:
  // "-" is standard input. Throws InputError when the file can not be opened.
  explicit TraceReader(const std::string& file);

  // The next call, or nothing at the end. Throws InputError when there is none on a line that is not blank.
  std::optional<TraceCall> next();

  // Where the last line was read, for messages: "FILE:LINE", or the file alone before the first one.
  std::string position() const;

 private:
  struct Close {
    void operator()(std::FILE* file) const;
  };
  struct Free {
    void operator()(char* text) const;
  };

  bool readLine();

  std::string name;
  std::unique_ptr<std::FILE, Close> stream;
  std::unique_ptr<char, Free> buffer;
  size_t bufferSize = 0;
  size_t lineLength = 0;
  size_t lineNumber = 0;
};

}  // namespace senseloom::tool
