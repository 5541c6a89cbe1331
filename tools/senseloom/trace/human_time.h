#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace senseloom::tool {

// A timestamp as people read it: below 100 hours as hours, minutes and seconds; from 1990 on, counted from 1970, as a
// date and a time in UTC; else as days and a time. `unit` is that of the timestamp, in nanoseconds.
std::string humanTime(uint64_t timestamp, int64_t unit);

// The timestamps for at most `most` marks on an axis: multiples of a round number of seconds, minutes, hours or days.
std::vector<uint64_t> timeMarks(uint64_t first, uint64_t last, int64_t unit, int most);

}  // namespace senseloom::tool
