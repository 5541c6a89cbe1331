#include "trace/trace_reader.h"

#include <sys/stat.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <string_view>
#include <utility>

#include "trace/hex.h"
#include "input_error.h"

namespace senseloom::tool {
namespace {

struct CallRow {
  CallKind kind;
  const char* name;
};
constexpr CallRow kCalls[] = {
    {CallKind::open, "open"},   {CallKind::setOption, "set_option"}, {CallKind::dispatch, "dispatch"},
    {CallKind::close, "close"}, {CallKind::uninit, "uninit"},
};

const json_t* member(const Json& object, const char* key) {
  const json_t* value = json_object_get(object.get(), key);
  if (value == nullptr) throw InputError(std::string("missing \"") + key + '"');
  return value;
}

std::string stringMember(const Json& object, const char* key) {
  const json_t* value = member(object, key);
  if (!json_is_string(value)) throw InputError('"' + std::string(key) + "\" must be a string");
  return json_string_value(value);
}

CallKind callMember(const Json& object) {
  const std::string name = stringMember(object, "call");
  const auto* row =
      std::find_if(std::begin(kCalls), std::end(kCalls), [&name](const CallRow& call) { return name == call.name; });
  if (row == std::end(kCalls)) {
    throw InputError("unknown call \"" + name + "\": open, set_option, dispatch, close and uninit are known");
  }
  return row->kind;
}

std::string sessionMember(const Json& object) {
  std::string name = stringMember(object, "session");
  if (name.empty()) throw InputError("\"session\" must not be empty");
  return name;
}

const RecordLayout* sensorMember(const Json& object) {
  const std::string name = stringMember(object, "sensor");
  const RecordLayout* sensor = findRecordLayout(name);
  if (sensor == nullptr) {
    throw InputError("unknown sensor \"" + name + "\": `senseloom sensors` prints those that are known");
  }
  return sensor;
}

// An option given as a string reaches the library as it stands, be it JSON or not; one that no string can hold is given
// as bytes.
std::optional<std::string> optionMember(const Json& object) {
  if (json_object_get(object.get(), "optionHex") != nullptr) {
    const auto bytes = fromHex(stringMember(object, "optionHex"));
    if (!bytes) throw InputError("\"optionHex\" must hold hexadecimal digits, two a byte");
    return std::string(bytes->begin(), bytes->end());
  }
  const json_t* option = member(object, "option");
  if (json_is_null(option)) return std::nullopt;
  if (json_is_string(option)) return json_string_value(option);
  if (json_is_object(option)) return compactText(option);
  throw InputError("\"option\" must be an object, a string or null");
}

Json recordMember(const Json& object) {
  const json_t* record = member(object, "record");
  if (!json_is_object(record)) throw InputError("\"record\" must be an object");
  return Json(json_incref(const_cast<json_t*>(record)));
}

Json recordedMembers(const Json& object) {
  if (json_object_get(object.get(), "returned") == nullptr) return nullptr;
  Json recorded(json_object());
  for (const char* key : {"returned", "properties", "result"}) {
    if (json_t* value = json_object_get(object.get(), key)) addMember(recorded, key, Json(json_incref(value)));
  }
  return recorded;
}

bool isNote(const Json& object) {
  return json_object_get(object.get(), "call") == nullptr && json_object_get(object.get(), "note") != nullptr;
}

}  // namespace

const char* callName(CallKind kind) {
  return std::find_if(std::begin(kCalls), std::end(kCalls), [kind](const CallRow& call) { return call.kind == kind; })
      ->name;
}

void TraceReader::Close::operator()(std::FILE* file) const {
  if (file != stdin) std::fclose(file);
}

void TraceReader::Free::operator()(char* text) const {
  std::free(text);
}

TraceReader::TraceReader(const std::string& file)
    : name(file == "-" ? "standard input" : file), stream(file == "-" ? stdin : std::fopen(file.c_str(), "r")) {
  if (stream == nullptr) throw InputError(name + ": " + std::strerror(errno));
}

std::optional<TraceCall> TraceReader::next() {
  Json object;
  do {
    object = nextObject();
    if (object == nullptr) return std::nullopt;
  } while (isNote(object));

  TraceCall call;
  call.line = lineNumber;
  call.kind = callMember(object);
  call.recorded = recordedMembers(object);
  switch (call.kind) {
    case CallKind::open:
      call.session = sessionMember(object);
      call.sensor = sensorMember(object);
      break;
    case CallKind::setOption:
      call.session = sessionMember(object);
      call.option = optionMember(object);
      break;
    case CallKind::dispatch: {
      const bool hasSession = json_object_get(object.get(), "session") != nullptr;
      const bool hasSensor = json_object_get(object.get(), "sensor") != nullptr;
      if (hasSession == hasSensor) throw InputError("a dispatch needs either \"session\" or \"sensor\"");
      if (hasSession) {
        call.session = sessionMember(object);
      } else {
        call.sensor = sensorMember(object);
      }
      call.record = recordMember(object);
      break;
    }
    case CallKind::close:
      call.session = sessionMember(object);
      break;
    case CallKind::uninit:
      break;
  }
  return call;
}

std::string TraceReader::position() const {
  return lineNumber == 0 ? name : name + ':' + std::to_string(lineNumber);
}

uint64_t TraceReader::size() const {
  struct stat file {};
  if (fstat(fileno(stream.get()), &file) != 0 || !S_ISREG(file.st_mode)) return 0;
  return static_cast<uint64_t>(file.st_size);
}

// The object on the next line that is not blank; null at the end.
Json TraceReader::nextObject() {
  do {
    if (!readLine()) return nullptr;
  } while (std::string_view(buffer.get(), lineLength).find_first_not_of(" \t\r\n") == std::string_view::npos);

  json_error_t error;
  Json object(json_loadb(buffer.get(), lineLength, JSON_REJECT_DUPLICATES, &error));
  if (object == nullptr) throw InputError(std::string("not JSON: ") + error.text);
  if (!json_is_object(object.get())) throw InputError("not a JSON object");
  return object;
}

bool TraceReader::readLine() {
  char* line = buffer.release();
  errno = 0;
  const ssize_t length = getline(&line, &bufferSize, stream.get());
  buffer.reset(line);
  if (length < 0) {
    if (std::ferror(stream.get()) != 0) throw InputError(std::string("can not be read: ") + std::strerror(errno));
    return false;
  }
  lineLength = static_cast<size_t>(length);
  ++lineNumber;
  byteCount += lineLength;
  return true;
}

}  // namespace senseloom::tool
