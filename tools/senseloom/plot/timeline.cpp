#include "plot/timeline.h"

#include <algorithm>

namespace senseloom::tool {

bool Timeline::add(uint64_t timestamp) {
  const bool isFull = nextBin() == kBins;
  if (isFull) {
    ++shift;
    for (size_t i = 0; i < kBins / 2; ++i) timestamps[i] = timestamps[2 * i];
  }
  const bool beginsBin = (count & ((size_t{1} << shift) - 1)) == 0;
  if (beginsBin) timestamps[nextBin()] = timestamp;
  if (timestamp < lastTimestamp) isRising = false;
  lastTimestamp = timestamp;
  ++count;
  return isFull;
}

double Timeline::placeOf(size_t bin) const {
  if (count == 0) return 0;
  const size_t before = std::min(bin << shift, count);
  if (before == count) return 1;
  const double value = isTime() ? static_cast<double>(timestamps[bin]) : static_cast<double>(before) + 1;
  return (value - first()) / (last() - first());
}

double Timeline::first() const {
  return isTime() ? static_cast<double>(timestamps[0]) : 1;
}

double Timeline::last() const {
  if (!isTime()) return static_cast<double>(count) + 1;
  const double span = static_cast<double>(lastTimestamp - timestamps[0]);
  return static_cast<double>(lastTimestamp) + span / static_cast<double>(count - 1);
}

}  // namespace senseloom::tool
