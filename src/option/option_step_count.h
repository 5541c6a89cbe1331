#pragma once

#include "option/described_option.h"

namespace senseloom {

inline constexpr OptionKey kStepCountKeys[] = {
    {.name = "mode", .defaultValue = 1, .range = {0, 1}, .merge = Merge::allOne},
    // A plain count, in hundreds of steps, and no logarithm, despite its name.
    {.name = "logN",
     .defaultValue = 1,
     .range = {1, 100},
     .outOfRange = OutOfRange::clamped,
     .merge = Merge::minimum,
     .note = "a plain count, in hundreds of steps"},
};
inline constexpr OptionProperty kStepCountProperties[] = {{141, "mode", 0}, {142, "logN", 1}};
inline constexpr OptionDescription kStepCount{
    .sensor = "SCOUN",
    .title = "step count",
    .keys = kStepCountKeys,
    .properties = kStepCountProperties,
    .logTag = kLogTag,
    .note = "the session accepts a string that is no JSON, too; it changes nothing",
};
class OptionStepCount final : public OptionKind<OptionStepCount, kStepCount> {
 public:
  int32_t mode() const { return settings[0]; }
  int32_t logN() const { return settings[1]; }
};

}  // namespace senseloom
