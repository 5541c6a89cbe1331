#pragma once

#include "option/integer_option.h"

namespace senseloom {

inline constexpr OptionKey kTappingKeys[] = {
    {.name = "classMask",
     .defaultValue = 3,
     .range = {1, 3},
     .message = "tapping: invalid clsmask value %d",
     .merge = Merge::bitOr},
    {.name = "level",
     .range = {-5, 5},
     .outOfRange = OutOfRange::kept,
     .message = "tapping: invalid level value %d",
     .merge = Merge::minimum,
     .note = "a level out of range sets \"classMask\" to 0"},
};
inline constexpr OptionProperty kTappingProperties[] = {{101, "classMask"}, {102, "level"}};
inline constexpr OptionDescription kTapping{
    .sensor = "STAP",
    .title = "tapping",
    .keys = kTappingKeys,
    .properties = kTappingProperties,
    .logTag = kLogTag,
};

class OptionTapping final : public IntegerOption<OptionTapping, kTapping> {
 public:
  int32_t classMask() const { return setting<kind.key("classMask")>(); }

 private:
  void adjust(const Settings& given) override;
};

}  // namespace senseloom
