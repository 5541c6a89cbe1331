#include "trace/trace_reader.h"

#include <sys/stat.h>

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <string_view>

#include "input_error.h"
#include "trace/time_unit.h"

namespace senseloom::tool {

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
  while (true) {
    object = nextObject();
    if (object == nullptr) return std::nullopt;
    if (!isNote(object)) break;
    readNote(object);
  }

  TraceCall call = readCall(object);
  call.line = lineNumber;
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

void TraceReader::readNote(const Json& note) {
  const json_t* said = json_object_get(note.get(), member::kTimeUnit);
  if (said == nullptr) return;
  if (!json_is_string(said)) throw InputError("\"timeUnit\" must be a string");
  unit = timeUnitNamed(json_string_value(said));
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
    if (std::ferror(stream.get()) != 0) throw InputError(std::string("cannot be read: ") + std::strerror(errno));
    return false;
  }
  lineLength = static_cast<size_t>(length);
  ++lineNumber;
  byteCount += lineLength;
  return true;
}

}  // namespace senseloom::tool
