#include "option/option_activity.h"

#include <algorithm>

namespace senseloom {
namespace {

// Shift counts use their low 5 bits, and what leaves the 32 bits is lost: "logN" as given can be any number.
uint32_t shiftLeft(uint32_t value, int32_t count) {
  return value << (static_cast<uint32_t>(count) & 31U);
}

}  // namespace

void OptionActivity::adjust(const Values& read) {
  settings[2] = std::min(logM(), logN());
  largestLogN = read[1];
}

void OptionActivity::merge(const Option& other) {
  const auto& that = static_cast<const OptionActivity&>(other);
  const bool sameSpan = logN() == that.logN();
  // The other's clamped logN and not its maxLogN, on purpose: only the option that the merge starts from brings in a
  // value as it was given.
  largestLogN = std::max(largestLogN, that.logN());
  OptionKind::merge(other);
  if (!sameSpan) settings[0] = 0;  // sessions with different spans can not share one report on change
}

int32_t OptionActivity::computeProperty(int32_t id) const {
  const auto smallest = static_cast<int32_t>(shiftLeft(1, logN()));
  if (id == 44) return smallest >> (static_cast<uint32_t>(logM()) & 31U);
  return static_cast<int32_t>(shiftLeft(shiftLeft(1, largestLogN), 16) | static_cast<uint32_t>(smallest));
}

}  // namespace senseloom
