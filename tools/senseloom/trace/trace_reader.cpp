#include "trace/trace_reader.h"

#include <algorithm>
#include <cstdio>
#include <utility>

#include "input_error.h"
#include "terminal/interrupt.h"
#include "trace/byte_order_mark.h"
#include "trace/followed_bytes.h"
#include "trace/time_unit.h"
#include "trace/trace_time.h"

namespace senseloom::tool {
namespace {

constexpr size_t kChunk = 1 << 16;

std::unique_ptr<ByteStream> open(const std::string& file, const std::string& name, bool follows,
                                 const BeforeWait& beforeWait) try {
  return follows ? followBytes(file, beforeWait) : openBytes(file);
} catch (const InputError& error) {
  throw InputError(name + ": " + error.what());
}

int64_t integerMember(const Json& object, const char* key) {
  return json_integer_value(json_object_get(object.get(), key));
}

bool hasMember(const Json& object, const char* key) {
  return json_object_get(object.get(), key) != nullptr;
}

}  // namespace

TraceReader::TraceReader(const std::string& file, Remark toRemark, TraceReading reading)
    : name(file == "-" ? "standard input" : file), remark(std::move(toRemark)) {
  if (!reading.follows) beforeRead = reading.meanwhile;
  stream = open(file, name, reading.follows, [this, meanwhile = std::move(reading.meanwhile)] {
    if (meanwhile) meanwhile();
    return !hasEnd;
  });
}

std::optional<TraceCall> TraceReader::next() {
  Json object;
  while (true) {
    object = nextObject();
    if (object == nullptr) return end();
    if (!readAside(object)) break;
  }

  if (!isRecording && hasMember(object, member::kAt)) {
    throw InputError("this is in the middle of a recording, whose head is missing");
  }
  ++calls;
  hasEnd = false;
  TraceCall call = readCall(object);
  call.line = lineNumber;
  return call;
}

std::string TraceReader::position() const {
  return lineNumber == 0 ? name : name + ':' + std::to_string(lineNumber);
}

void TraceReader::printOnStandardError(const std::string& text) {
  std::fprintf(stderr, "senseloom: %s\n", text.c_str());
}

// The object on the next line that is not blank; null at the end.
Json TraceReader::nextObject() {
  std::string_view line;
  do {
    if (isInterrupted() || !readLine()) return nullptr;
    line = std::string_view(buffer).substr(lineStart, lineLength);
    if (lineNumber == 1 && line.starts_with(kByteOrderMark)) line.remove_prefix(kByteOrderMark.size());
    // Room that a recording has reserved, and did not come to use.
    if (isRecording && line.front() == '\0') return nullptr;
  } while (line.find_first_not_of(" \t\r\n") == std::string_view::npos);

  json_error_t error;
  Json object(json_loadb(line.data(), line.size(), JSON_REJECT_DUPLICATES, &error));
  if (object == nullptr) {
    if (!isLineWhole && (isRecording || isInterrupted())) return nullptr;
    throw InputError(std::string("not JSON: ") + error.text);
  }
  if (!json_is_object(object.get())) throw InputError("not a JSON object");
  return object;
}

bool TraceReader::readLine() {
  lineStart += std::exchange(lineLength, 0);
  size_t searched = lineStart;
  size_t feed;
  while ((feed = buffer.find('\n', searched)) == std::string::npos) {
    buffer.erase(0, std::exchange(lineStart, 0));
    searched = buffer.size();
    buffer.resize(searched + kChunk);
    size_t count = 0;
    try {
      if (beforeRead) beforeRead();
      count = stream->read(buffer.data() + searched, kChunk);
    } catch (...) {
      buffer.resize(searched);
      throw;
    }
    buffer.resize(searched + count);
    if (count == 0) break;
  }
  isLineWhole = feed != std::string::npos;
  lineLength = (isLineWhole ? feed + 1 : buffer.size()) - lineStart;
  if (lineLength == 0) return false;
  ++lineNumber;
  byteCount += lineLength;
  return true;
}

// Takes what is no call for a replay: a release, a note, or what a recording says of itself.
bool TraceReader::readAside(const Json& object) {
  if (isRelease(object)) {
    hasEnd = false;
    releasedList(object);  // it has to name one
  } else if (hasMember(object, member::kCall)) {
    return false;
  } else if (hasMember(object, member::kFormat)) {
    readHead(object);
  } else if (hasMember(object, member::kEnd)) {
    readEnd(object);
  } else if (isNote(object)) {
    readNote(object);
  } else {
    return false;
  }
  if (onAside) onAside(lineNumber, object);
  return true;
}

void TraceReader::readNote(const Json& note) {
  if (hasMember(note, member::kBreach)) remark(position() + ": " + textMember(note.get(), member::kNote));
  readAboutRecords(note);
}

void TraceReader::readAboutRecords(const Json& object) {
  if (const json_t* said = json_object_get(object.get(), member::kTimeUnit)) {
    if (!json_is_string(said)) throw InputError("\"timeUnit\" must be a string");
    unit = timeUnitNamed(json_string_value(said));
  }
  const json_t* said = json_object_get(object.get(), member::kClassNames);
  if (said == nullptr) return;
  names.clear();
  for (size_t i = 0; i < json_array_size(said); ++i) {
    const char* text = json_string_value(json_array_get(said, i));
    if (text == nullptr) break;
    names.emplace_back(text);
  }
  if (names.size() != json_array_size(said) || names.empty()) {
    throw InputError("\"classNames\" must be an array of strings");
  }
}

void TraceReader::readHead(const Json& object) {
  const int64_t format = integerMember(object, member::kFormat);
  if (format != kTraceFormat) {
    throw InputError("a trace of format " + std::to_string(format) + ", where this program reads format " +
                     std::to_string(kTraceFormat));
  }
  if (isRecording)
    throw InputError("another recording, or another part of it, begins here: each is a trace of its own");
  isRecording = true;
  start = clockFromText(textMember(object.get(), member::kStarted));
  readAboutRecords(object);
}

void TraceReader::readEnd(const Json& object) {
  hasEnd = true;
  const auto told = static_cast<uint64_t>(integerMember(object, member::kEnd));
  if (told != calls) {
    remark(position() + ": the recording ended with " + std::to_string(told) + " calls, but " + std::to_string(calls) +
           " are there");
  }
  const int64_t lost = integerMember(object, member::kLost);
  if (lost != 0) {
    remark(position() + ": " + std::to_string(lost) +
           " lines could not be recorded: " + textMember(object.get(), member::kWhy));
  }
  if (hasMember(object, member::kCause)) remark(position() + ": " + textMember(object.get(), member::kCause));
}

std::nullopt_t TraceReader::end() {
  if (std::exchange(wasEndReached, true) || isInterrupted()) return std::nullopt;
  if (calls == 0) remark(name + ": the trace is empty: there is no call in it");
  if (isRecording && !hasEnd) {
    remark(name + ": the recording was cut short after " + std::to_string(calls) + " calls: its end is missing");
  }
  return std::nullopt;
}

}  // namespace senseloom::tool
