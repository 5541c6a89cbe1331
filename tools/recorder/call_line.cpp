#include "call_line.h"

#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <ctime>
#include <span>

#include "library.h"

namespace senseloom::trace {

using tool::TraceLine;
namespace member = tool::member;

namespace {

constexpr int64_t kSecond = 1'000'000'000;
constexpr int64_t kMicrosecond = 1000;

// As ISO 8601 has it, in UTC.
std::string wallClockText(int64_t nanoseconds) {
  const auto seconds = static_cast<time_t>(nanoseconds / kSecond);
  std::tm parts{};
  gmtime_r(&seconds, &parts);
  char text[64];
  std::snprintf(text, sizeof text, "%04d-%02d-%02dT%02d:%02d:%02d.%06dZ", parts.tm_year + 1900, parts.tm_mon + 1,
                parts.tm_mday, parts.tm_hour, parts.tm_min, parts.tm_sec,
                static_cast<int>(nanoseconds % kSecond / kMicrosecond));
  return text;
}

std::string programFile() {
  char name[4096];
  const ssize_t length = readlink("/proc/self/exe", name, sizeof name);
  return {name, length < 0 ? 0 : static_cast<size_t>(length)};
}

}  // namespace

std::string headLine(uint32_t part, int64_t startedAt) {
  const int error = errno;
  TraceLine line;
  line.addInteger(member::kFormat, tool::kTraceFormat);
  line.addText(member::kTool, SENSELOOM_VERSION);
  line.addText(member::kLibrary, libraryFile());
  if (const auto build = libraryBuild(); !build.empty()) line.addHexText(member::kLibraryBuild, build);
  line.addText(member::kProgram, programFile());
  line.addInteger(member::kProcess, getpid());
  line.addInteger(member::kBits, 8 * sizeof(void*));
  line.addText(member::kStarted, wallClockText(startedAt));
  line.addText(member::kClock, "CLOCK_MONOTONIC");
  line.addInteger(member::kPart, part);
  errno = error;
  return std::string(line.finish());
}

std::string breachLine(const Breach& breach, int64_t at) {
  TraceLine line;
  line.addText(member::kNote, breach.text);
  line.addText(member::kBreach, breach.kind);
  line.addThreads(breach.threads);
  line.addInteger(member::kAt, at / kMicrosecond);
  return std::string(line.finish());
}

std::string releaseLine(const void* list, int64_t number, int64_t at, int thread) {
  TraceLine line;
  line.addText(member::kCall, tool::kRelease);
  if (list == nullptr) {
    line.addNull(member::kList);
  } else if (number == 0) {
    line.addText(member::kList, tool::kUnknownList);
  } else {
    line.addInteger(member::kList, number);
  }
  line.addInteger(member::kAt, at / kMicrosecond);
  line.addInteger(member::kThread, thread);
  return std::string(line.finish());
}

std::string listNote(const std::string& sensor, const ctx_option_t& list) {
  TraceLine line;
  line.addText(member::kNote, "the properties in force");
  line.addText(member::kSensor, sensor);
  addProperties(line, list);
  return std::string(line.finish());
}

void addProperties(TraceLine& line, const ctx_option_t& list) {
  line.beginArray(member::kProperties);
  for (int32_t i = 0; i < list.count; ++i) {
    const ctx_property_t& property = list.properties[i];
    line.addProperty(property.id, {static_cast<const uint8_t*>(property.value), static_cast<size_t>(property.size)});
  }
  line.endArray();
}

void addTime(TraceLine& line, const CallTime& time) {
  line.addInteger(member::kAt, time.at / kMicrosecond);
  line.addInteger(member::kThread, time.thread);
  line.addInteger(member::kTook, time.took);
}

}  // namespace senseloom::trace
