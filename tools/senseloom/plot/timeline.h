#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

namespace senseloom::tool {

// Where records come to lie in a picture of a bounded size: in bins of one record each at first. When all are in use,
// each two become one, so that bins hold 2, then 4 records, and so on.
class Timeline {
 public:
  static constexpr size_t kBins = 1024;
  // What comes after the last record lies in one more bin.
  static constexpr size_t kPlaces = kBins + 1;

  // Takes a record. True when bins were folded: what lay in bin i lies in bin i / 2 now.
  bool add(uint64_t timestamp);

  // The bins of the last record, and of the next one.
  size_t bin() const { return (count - 1) >> shift; }
  size_t nextBin() const { return count >> shift; }
  size_t records() const { return count; }

  // Where a bin begins, from 0 (the first record) to 1: by the timestamp of its first record or, when timestamps do not
  // rise, by the number of records before it.
  double placeOf(size_t bin) const;
  bool isTime() const { return isRising && lastTimestamp > timestamps[0]; }
  // What stands at 0 and at 1: the axis goes on for one record after the last, for what that brings.
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
