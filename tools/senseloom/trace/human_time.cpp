#include "trace/human_time.h"

#include <algorithm>
#include <array>
#include <cinttypes>
#include <cstdio>
#include <ctime>
#include <iterator>

#include "trace/time_unit.h"

namespace senseloom::tool {
namespace {

constexpr uint64_t kLongestDuration = 100 * 3600;  // in seconds
constexpr uint64_t kFirstDate = 631'152'000;       // 1990
constexpr uint64_t kLastDate = 253'402'300'799;    // the end of the year 9999
constexpr uint64_t kDay = 86'400;

template <class... Values>
std::string formatted(const char* format, Values... values) {
  std::array<char, 96> text;
  std::snprintf(text.data(), text.size(), format, values...);
  return text.data();
}

// The least of 1, 2 and 5 times a power of ten that is not below.
uint64_t roundedUp(uint64_t least) {
  uint64_t power = 1;
  while (power <= least / 10) power *= 10;
  for (const uint64_t factor : {uint64_t{1}, uint64_t{2}, uint64_t{5}}) {
    if (factor * power >= least) return factor * power;
  }
  return 10 * power;
}

}  // namespace

std::string humanTime(uint64_t timestamp, int64_t unit) {
  const auto perSecond = static_cast<uint64_t>(kSecond / unit);
  const uint64_t seconds = timestamp / perSecond;
  std::string rest = formatted(":%02d:%02d", static_cast<int>(seconds / 60 % 60), static_cast<int>(seconds % 60));
  if (const uint64_t nanoseconds = timestamp % perSecond * static_cast<uint64_t>(unit); nanoseconds > 0) {
    rest += formatted(".%09" PRIu64, nanoseconds);
    rest.erase(std::max(rest.find_last_not_of('0') + 1, rest.size() - 6));  // three digits at least
  }
  if (seconds < kLongestDuration) return std::to_string(seconds / 3600) + rest;
  const std::string clock = std::to_string(seconds / 3600 % 24) + rest;
  if (seconds < kFirstDate || seconds > kLastDate) return std::to_string(seconds / kDay) + " d " + clock;
  const auto date = static_cast<std::time_t>(seconds);
  std::tm parts{};
  gmtime_r(&date, &parts);
  return formatted("%04d-%02d-%02d ", parts.tm_year + 1900, parts.tm_mon + 1, parts.tm_mday) + clock;
}

std::vector<uint64_t> timeMarks(uint64_t first, uint64_t last, int64_t unit, int most) {
  constexpr uint64_t kSteps[] = {1,   2,   5,    10,   15,   30,    60,    120,   300,
                                 600, 900, 1800, 3600, 7200, 10800, 21600, 43200, kDay};
  const auto perSecond = static_cast<uint64_t>(kSecond / unit);
  const uint64_t least = (last - first) / static_cast<uint64_t>(most) + 1;
  const auto* const step = std::ranges::find_if(kSteps, [&](uint64_t seconds) { return seconds * perSecond >= least; });
  uint64_t size =
      step == std::end(kSteps) ? roundedUp(least / (kDay * perSecond) + 1) * kDay * perSecond : *step * perSecond;
  if (least < perSecond) size = roundedUp(least);
  std::vector<uint64_t> marks;
  for (uint64_t mark = (first / size + (first % size == 0 ? 0 : 1)) * size; mark <= last; mark += size) {
    marks.push_back(mark);
    if (mark > UINT64_MAX - size) break;
  }
  return marks;
}

}  // namespace senseloom::tool
