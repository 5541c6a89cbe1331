#pragma once

#include "option/integer_option.h"

namespace senseloom {

inline constexpr OptionKey kAudioClassificationKeys[] = {
    {.name = "interval", .defaultValue = 5000, .merge = Merge::takeLast},
};
// Id 0 is on purpose: this is the one property that has it.
inline constexpr OptionProperty kAudioClassificationProperties[] = {{0, "interval"}};
inline constexpr OptionDescription kAudioClassification{
    .sensor = "LPE_P",
    .title = "audio classification",
    .keys = kAudioClassificationKeys,
    .properties = kAudioClassificationProperties,
    .logTag = kLogTag,
    .unparsableMessage = "audio : invalid opton string %s, all set as default",
};
class OptionAudioClassification final : public IntegerOption<OptionAudioClassification, kAudioClassification> {};

}  // namespace senseloom
