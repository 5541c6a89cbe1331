#include "trace/time_unit.h"

#include <charconv>
#include <limits>

#include "input_error.h"

namespace senseloom::tool {
namespace {

struct UnitRow {
  const char* name;
  int64_t nanoseconds;
};
constexpr UnitRow kUnits[] = {{"s", kSecond}, {"ms", kMillisecond}, {"us", 1'000}, {"ns", 1}};

// The digits behind the point, as nanoseconds.
int64_t fractionOf(std::string_view digits, int64_t unit) {
  int64_t fraction = 0;
  for (const char digit : digits) {
    const int64_t value = digit - '0';
    if (unit == 1) return fraction + (value >= 5 ? 1 : 0);
    unit /= 10;
    fraction += value * unit;
  }
  return fraction;
}

}  // namespace

int64_t timeUnitNamed(std::string_view name) {
  for (const UnitRow& row : kUnits) {
    if (name == row.name) return row.nanoseconds;
  }
  throw InputError("unknown time unit \"" + std::string(name) + "\": " + kTimeUnits + " are known");
}

std::string timeUnitName(int64_t unit) {
  for (const UnitRow& row : kUnits) {
    if (unit == row.nanoseconds) return row.name;
  }
  return "?";
}

int64_t timeOf(uint64_t count, int64_t unit) {
  if (count >= static_cast<uint64_t>(std::numeric_limits<int64_t>::max() / unit)) {
    throw InputError("the time " + std::to_string(count) + ' ' + timeUnitName(unit) + " is beyond 292 years");
  }
  return static_cast<int64_t>(count) * unit;
}

int64_t timeFromText(std::string_view text, int64_t unit) {
  const size_t point = text.find('.');
  const std::string_view whole = text.substr(0, point);
  const std::string_view fraction = point == std::string_view::npos ? "" : text.substr(point + 1);
  const bool isNumber = !whole.empty() && text.back() != '.' &&
                        (whole.find_first_not_of("0123456789") == std::string_view::npos) &&
                        (fraction.find_first_not_of("0123456789") == std::string_view::npos);
  if (!isNumber) throw InputError('"' + std::string(text) + "\" is not a time: a number such as 12 or 3.84");
  uint64_t count = std::numeric_limits<uint64_t>::max();  // what a number out of range leaves
  std::from_chars(whole.data(), whole.data() + whole.size(), count);
  return timeOf(count, unit) + fractionOf(fraction, unit);
}

}  // namespace senseloom::tool
