#include "option/option_activity.h"

#include <algorithm>

namespace senseloom {
namespace {

// Shift counts use their low 5 bits, and what leaves the 32 bits is lost: "logN" as given can be any number.
uint32_t shiftLeft(uint32_t value, int32_t count) {
  return value << (static_cast<uint32_t>(count) & 31U);
}

}  // namespace

void OptionActivity::adjust(const Settings& given) {
  set<kind.key("logM")>(std::min(logM(), logN()));
  constexpr size_t kLogN = kind.key("logN");
  maxLogN = given[kLogN];
}

void OptionActivity::merge(const Option& other) {
  const auto& theirs = static_cast<const OptionActivity&>(other);
  const bool sameSpan = logN() == theirs.logN();
  // The other's clamped logN and not its maxLogN, on purpose: only the option that the merge starts from brings in a
  // value as it was given.
  maxLogN = std::max(maxLogN, theirs.logN());
  IntegerOption::merge(other);
  if (!sameSpan) set<kind.key("mode")>(0);  // sessions with different spans cannot share one report on change
}

int32_t OptionActivity::compute(const OptionProperty& property) const {
  const auto smallest = static_cast<int32_t>(shiftLeft(1, logN()));
  if (property.id == kDecisionsPerSpan.id) return smallest >> (static_cast<uint32_t>(logM()) & 31U);
  return static_cast<int32_t>(shiftLeft(shiftLeft(1, maxLogN), 16) | static_cast<uint32_t>(smallest));
}

}  // namespace senseloom
