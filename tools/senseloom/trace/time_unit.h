#pragma once

#include <cstdint>
#include <string>
#include <string_view>

// What the timestamps of traces and the times in tables of text mean. The library never interprets a timestamp.
namespace senseloom::tool {

inline constexpr char kTimeUnits[] = "s, ms, us and ns";
inline constexpr int64_t kSecond = 1'000'000'000;  // in nanoseconds
inline constexpr int64_t kMillisecond = 1'000'000;

// How long the unit is, in nanoseconds. Throws InputError if it is not one of kTimeUnits.
int64_t timeUnitNamed(std::string_view name);
// The name of a unit that timeUnitNamed() knows.
std::string timeUnitName(int64_t unit);

// A time of so many units, in nanoseconds. Throws InputError if it is beyond the 292 years that these can count.
int64_t timeOf(uint64_t count, int64_t unit);
// The same for a decimal number, rounded to a nanosecond. Throws InputError if the text is not one, or negative.
int64_t timeFromText(std::string_view text, int64_t unit);

}  // namespace senseloom::tool
