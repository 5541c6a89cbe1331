#include "trace/trace_time.h"

#include <cstdio>
#include <ctime>
#include <limits>

#include "trace/record_field.h"
#include "trace/time_unit.h"

namespace senseloom::tool {
namespace {

constexpr int64_t kMicrosecond = 1'000;

}  // namespace

void TraceTime::pass(const CallOutcome& outcome) {
  if (outcome.call.atMicroseconds) {
    elapsed = *outcome.call.atMicroseconds * kMicrosecond;
    if (const auto started = trace.started()) wall = *started + *elapsed;
    return;
  }
  const auto known = unit ? unit : trace.timeUnit();
  const auto timestamp = recordField<uint64_t>(outcome.record, kTimestampOffset);
  if (!known || !timestamp) return;
  if (!firstTimestamp) firstTimestamp = timestamp;
  const auto most = static_cast<uint64_t>(std::numeric_limits<int64_t>::max() / *known);
  if (*timestamp > most) return;
  wall = static_cast<int64_t>(*timestamp) * *known;
  elapsed = *wall - static_cast<int64_t>(*firstTimestamp) * *known;
}

std::string elapsedText(int64_t nanoseconds) {
  const bool isBefore = nanoseconds < 0;
  const int64_t milliseconds = (isBefore ? -nanoseconds : nanoseconds) / kMillisecond;
  const int64_t seconds = milliseconds / 1000;
  char text[48];
  std::snprintf(text, sizeof text, "%s%lld:%02lld:%02lld.%03lld", isBefore ? "-" : "",
                static_cast<long long>(seconds / 3600), static_cast<long long>(seconds / 60 % 60),
                static_cast<long long>(seconds % 60), static_cast<long long>(milliseconds % 1000));
  return text;
}

std::string clockText(int64_t nanoseconds) {
  const auto seconds = static_cast<time_t>(nanoseconds / kSecond);
  tm parts{};
  gmtime_r(&seconds, &parts);
  char text[64];
  const size_t length = std::strftime(text, sizeof text, "%Y-%m-%d %H:%M:%S", &parts);
  std::snprintf(text + length, sizeof text - length, ".%03d", static_cast<int>(nanoseconds % kSecond / kMillisecond));
  return text;
}

std::optional<int64_t> clockFromText(const std::string& text) {
  tm parts{};
  char between = 0;
  double seconds = 0;
  if (std::sscanf(text.c_str(), "%4d-%2d-%2d%c%2d:%2d:%lf", &parts.tm_year, &parts.tm_mon, &parts.tm_mday, &between,
                  &parts.tm_hour, &parts.tm_min, &seconds) != 7) {
    return std::nullopt;
  }
  parts.tm_year -= 1900;
  parts.tm_mon -= 1;
  const int64_t minutes = timegm(&parts);
  return minutes * kSecond + static_cast<int64_t>(seconds * 1e6 + 0.5) * kMicrosecond;
}

}  // namespace senseloom::tool
