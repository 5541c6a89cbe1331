#pragma once

#include "option/integer_option.h"

namespace senseloom {

inline constexpr OptionKey kStepCountKeys[] = {
    {.name = "mode", .defaultValue = 1, .range = {0, 1}, .merge = Merge::allOne},
    // A plain count, in hundreds of steps, not a logarithm, despite its name.
    {.name = "logN", .defaultValue = 1, .range = {1, 100}, .outOfRange = OutOfRange::clamped, .merge = Merge::minimum},
};
inline constexpr OptionProperty kStepCountProperties[] = {{141, "mode"}, {142, "logN"}};
inline constexpr OptionDescription kStepCount{
    .sensor = "SCOUN",
    .title = "step count",
    .keys = kStepCountKeys,
    .properties = kStepCountProperties,
    .logTag = kLogTag,
    .note = "the session accepts a string that is not JSON, too; it changes nothing",
};
class OptionStepCount final : public IntegerOption<OptionStepCount, kStepCount> {
 public:
  int32_t mode() const { return setting<kind.key("mode")>(); }
  int32_t logN() const { return setting<kind.key("logN")>(); }
};

}  // namespace senseloom
