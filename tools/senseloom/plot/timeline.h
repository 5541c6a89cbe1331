#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

namespace senseloom::tool {

// Where records lie in a picture of bounded size: at first in bins of one record each. Whenever all bins are in use,
// pairs of them are joined, so that each holds 2 records, then 4, and so on.
class Timeline {
 public:
  static constexpr size_t kBins = 1024;
  // What comes after the last record lies in one more bin.
  static constexpr size_t kPlaces = kBins + 1;

  // Takes a record. Returns true when bins were joined: what was in bin i is in bin i / 2 now.
  bool add(uint64_t timestamp);

  // The bins of the last record, and of the next one.
  size_t bin() const { return (count - 1) >> shift; }
  size_t nextBin() const { return count >> shift; }
  size_t records() const { return count; }

  // Where a bin begins, from 0 (the first record) to 1: by the timestamp of its first record or, if timestamps do not
  // rise, by the number of records before it.
  double placeOf(size_t bin) const;
  bool isTime() const { return isRising && lastTimestamp > timestamps[0]; }
  // The values at 0 and at 1. The axis extends one record beyond the last one, to show its effect.
  double first() const;
  double last() const;

 private:
  bool isRising = true;
  unsigned shift = 0;
  size_t count = 0;
  uint64_t lastTimestamp = 0;
  std::array<uint64_t, kBins> timestamps{};  // of the first record of a bin
};

}  // namespace senseloom::tool
