#pragma once

#include <cstddef>
#include <cstdint>
#include <cstdio>

#include "trace/trace_line.h"

namespace senseloom::tool {

// Writes the trace of a day's commute as an activity classifier reports it: mostly one decision a record, now and then
// several; flicker and short misclassifications; and three clients that join and leave with different options. The seed
// decides everything. All arithmetic is on integers, so a seed gives the same bytes everywhere.
class CommuteGenerator {
 public:
  CommuteGenerator(std::FILE* stream, uint64_t seed, uint32_t recordCount)
      : out(stream), randomState(seed), records(recordCount) {}
  void write();

 private:
  uint64_t random();
  uint32_t randomBelow(uint32_t bound);
  int observe(int activity);
  void writeRecord(int activity);

  std::FILE* out;
  uint64_t randomState;
  uint32_t records;

  TraceLine line;
  uint64_t timestamp = (6 * 60 + 50) * 60 * 1000;  // milliseconds since midnight: ten to seven
  uint32_t sequence = 0;
  // The class that the classifier mistakes the activity for, and for how many more decisions.
  int mistaken = 0;
  uint32_t mistakes = 0;
};

}  // namespace senseloom::tool
