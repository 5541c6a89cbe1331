#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include "trace/byte_stream.h"
#include "trace/class_names.h"
#include "trace/json.h"
#include "trace/trace_call.h"

namespace senseloom::tool {

// How a trace is read.
struct TraceReading {
  // Of a file the end is waited for, too: until the recording has its end, or the user interrupts it.
  bool follows = false;
  // Called before each read of some hundred lines, so before every wait, too; if it follows, only while it waits, at
  // least ten times a second. May be null.
  std::function<void()> meanwhile = nullptr;
};

// Reads a trace, JSON Lines with one call a line, a line at a time. Blank lines are skipped, and so are lines with a
// "note" in place of a call and releases of property lists. What a recording says of itself is not a call either: what
// a reader of it should know, as that something is missing or that the program broke the library's contract, is passed
// on as remarks. A trace without a call is remarked upon, too.
class TraceReader {
 public:
  using Remark = std::function<void(const std::string& text)>;

  static void printOnStandardError(const std::string& text);

  // "-" is standard input. Throws InputError when the file cannot be opened.
  explicit TraceReader(const std::string& file, Remark remark = printOnStandardError, TraceReading reading = {});
  TraceReader(const TraceReader&) = delete;
  TraceReader& operator=(const TraceReader&) = delete;

  // The next call, or nothing at the end. Throws InputError when there is none on a line that is not blank.
  std::optional<TraceCall> next();

  // How long a unit of the timestamps is, in nanoseconds, if a note so far says so.
  std::optional<int64_t> timeUnit() const { return unit; }

  // When the recording began, in nanoseconds since 1970, if it says so.
  std::optional<int64_t> started() const { return start; }
  // The names of the classes from 0 on, if the head or a note so far has them.
  const ClassNames& classNames() const { return names; }

  // Has passed on what is no call for a replay: notes, releases of property lists, and the head and the end of a
  // recording, each with its line.
  using AsideListener = std::function<void(size_t line, const Json& object)>;
  void listen(AsideListener toAsides) { onAside = std::move(toAsides); }

  // The last line that was read, with its line feed.
  std::string_view line() const { return std::string_view(buffer).substr(lineStart, lineLength); }

  // Where the last line was read, for messages: "FILE:LINE", or the file alone before the first one.
  std::string position() const;

  // The file, for messages.
  const std::string& fileName() const { return name; }

  uint64_t bytesRead() const { return byteCount; }
  // Bytes of the whole trace; 0 when that is not known.
  uint64_t size() const { return stream->size(); }

 private:
  Json nextObject();
  bool readLine();
  bool readAside(const Json& object);
  void readNote(const Json& note);
  // What a note or a head may say of the records.
  void readAboutRecords(const Json& object);
  void readHead(const Json& object);
  void readEnd(const Json& object);
  std::nullopt_t end();

  std::string name;
  Remark remark;
  std::function<void()> beforeRead;  // may be null
  std::string buffer;                // what was read
  size_t lineStart = 0;              // in it
  size_t lineLength = 0;             // bytes, with the line feed
  bool isLineWhole = true;
  size_t lineNumber = 0;
  uint64_t byteCount = 0;
  std::optional<int64_t> unit;
  std::optional<int64_t> start;
  ClassNames names;
  AsideListener onAside;
  uint64_t calls = 0;
  bool isRecording = false;  // it has a head
  bool hasEnd = false;
  bool wasEndReached = false;
  std::unique_ptr<ByteStream> stream;
};

}  // namespace senseloom::tool
