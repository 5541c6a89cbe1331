#pragma once

#include "option/integer_option.h"

// The options that are a mask of wanted classes, or one sensitivity, and have no code of their own.
namespace senseloom {

inline constexpr OptionKey kGestureFlickKeys[] = {
    {.name = "classMask",
     .defaultValue = 63,
     .range = {1, 63},
     .message = "gestureflick: invalid clsmask value %d",
     .merge = Merge::bitOr},
    {.name = "level", .range = {-5, 5}, .message = "gestureflick: invalid level value %d", .merge = Merge::minimum},
};
inline constexpr OptionProperty kGestureFlickProperties[] = {{61, "classMask"}, {62, "level"}};
inline constexpr OptionDescription kGestureFlick{
    .sensor = "GSFLK",
    .title = "flick gesture",
    .keys = kGestureFlickKeys,
    .properties = kGestureFlickProperties,
    .logTag = kLogTag,
    .unparsableMessage = "gestureflick: invalid opton string %s, all set as default",
};
class OptionGestureFlick final : public IntegerOption<OptionGestureFlick, kGestureFlick> {
 public:
  int32_t classMask() const { return setting<kind.key("classMask")>(); }
};

inline constexpr OptionKey kShakingKeys[] = {
    {.name = "sensitivity",
     .defaultValue = 1,
     .range = {0, 2},
     .message = "shaking: invalid clsmask value %d",  // "clsmask" is the wording of every kind, this one included
     .merge = Merge::maximum},
};
inline constexpr OptionProperty kShakingProperties[] = {{81, "sensitivity"}};
inline constexpr OptionDescription kShaking{
    .sensor = "SHAKI",
    .title = "shaking",
    .keys = kShakingKeys,
    .properties = kShakingProperties,
    .logTag = kLogTag,
    .unparsableMessage = "shaking: invalid opton string %s, all set as default",
};
class OptionShaking final : public IntegerOption<OptionShaking, kShaking> {};

inline constexpr OptionKey kInstantActivityKeys[] = {
    {.name = "classMask",
     .defaultValue = 15,
     .range = {1, 15},
     .message = "instantactivity: invalid clsmask value %d",
     .merge = Merge::bitOr},
};
inline constexpr OptionProperty kInstantActivityProperties[] = {{151, "classMask"}};
inline constexpr OptionDescription kInstantActivity{
    .sensor = "ISACT",
    .title = "instant activity",
    .keys = kInstantActivityKeys,
    .properties = kInstantActivityProperties,
    .logTag = "STY",  // this kind alone logs under a tag of its own, on purpose
    .unparsableMessage = "instantactivity: invalid opton string %s, all set as default",
    // This kind accepts any string, on purpose: what cannot be read, a null text included, changes nothing.
    .unparsableResult = 0,
    .nullIsUnparsable = true,
    .note = "an option string that is not JSON is accepted and changes nothing",
};
class OptionInstantActivity final : public IntegerOption<OptionInstantActivity, kInstantActivity> {
 public:
  int32_t classMask() const { return setting<kind.key("classMask")>(); }
};

inline constexpr OptionKey kGestureHMMKeys[] = {
    {.name = "classMask",
     .defaultValue = 65535,
     .range = {1, 65535},
     .message = "gesture hmm: invalid clsmask value %d",
     .merge = Merge::bitOr},
};
inline constexpr OptionDescription kGestureHMM{
    .sensor = "GSPX",
    .title = "hand-drawn gesture",
    .keys = kGestureHMMKeys,
    .properties = {},  // the sensor itself has nothing to set: the recognition runs in the session
    .logTag = kLogTag,
    .unparsableMessage = "gesture hmm: invalid opton string %s, all set as default",
};
class OptionGestureHMM final : public IntegerOption<OptionGestureHMM, kGestureHMM> {
 public:
  int32_t classMask() const { return setting<kind.key("classMask")>(); }
};

inline constexpr OptionKey kGestureEartouchKeys[] = {
    {.name = "classMask",
     .defaultValue = 3,
     .range = {1, 3},
     .message = "gesture eartouch: invalid clsmask value %d",
     .merge = Merge::bitOr},
};
inline constexpr OptionProperty kGestureEartouchProperties[] = {{161, "classMask"}};
inline constexpr OptionDescription kGestureEartouch{
    .sensor = "GSETH",
    .title = "ear touch",
    .keys = kGestureEartouchKeys,
    .properties = kGestureEartouchProperties,
    .logTag = kLogTag,
    .unparsableMessage = "gesture eartouch: invalid opton string %s, all set as default",
};
class OptionGestureEartouch final : public IntegerOption<OptionGestureEartouch, kGestureEartouch> {
 public:
  int32_t classMask() const { return setting<kind.key("classMask")>(); }
};

inline constexpr OptionKey kLiftKeys[] = {
    {.name = "classMask",
     .defaultValue = 3,
     .range = kNoValue,  // every parse rejects its mask, the default included, and the mask stays 3: on purpose
     .message = "tapping: invalid clsmask value %d",  // shares the tapping message, on purpose
     .merge = Merge::bitOr},
};
inline constexpr OptionProperty kLiftProperties[] = {{201, "classMask"}};
inline constexpr OptionDescription kLift{
    .sensor = "LIFT",
    .title = "lift",
    .keys = kLiftKeys,
    .properties = kLiftProperties,
    .logTag = kLogTag,
    .note = "the mask is always 3, and every option string is logged as holding a bad one",
};
class OptionLift final : public IntegerOption<OptionLift, kLift> {};

}  // namespace senseloom
