#pragma once

#include "option/integer_option.h"

namespace senseloom {

inline constexpr OptionKey kActivityKeys[] = {
    {.name = "mode", .merge = Merge::allOne, .note = "merged to 1 only if \"logN\" is equal too"},
    {.name = "logN", .range = {0, 8}, .outOfRange = OutOfRange::clamped, .merge = Merge::minimum},
    {.name = "logM",
     .range = {0, 8},
     .outOfRange = OutOfRange::clamped,
     .merge = Merge::minimum,
     .note = "cut to \"logN\""},
    {.name = "classMask", .defaultValue = -1, .range = {-1, 255}, .merge = Merge::bitOr},
    {.name = "summary", .defaultValue = 1, .range = {0, 1}, .merge = Merge::keepFirst},
    {.name = "weightVar", .defaultValue = -1, .range = {.low = 0}, .merge = Merge::keepFirst},
    // Any other value switches the flag on, although a missing key leaves it off: intended.
    {.name = "continuous", .range = {0, 1}, .fallback = 1, .merge = Merge::anySet},
};
inline constexpr OptionProperty kSpans{43, "spans"};
inline constexpr OptionProperty kDecisionsPerSpan{44, "decisionsPerSpan"};
inline constexpr OptionProperty kActivityProperties[] = {{41, "mode"}, kSpans, kDecisionsPerSpan, {42, "classMask"}};
inline constexpr OptionDescription kActivity{
    .sensor = "PHYAC",
    .title = "physical activity",
    .keys = kActivityKeys,
    .properties = kActivityProperties,
    .logTag = kLogTag,
};

class OptionActivity final : public IntegerOption<OptionActivity, kActivity> {
 public:
  void merge(const Option& other) override;

  int32_t mode() const { return setting<kind.key("mode")>(); }
  int32_t logN() const { return setting<kind.key("logN")>(); }
  int32_t logM() const { return setting<kind.key("logM")>(); }
  int32_t classMask() const { return setting<kind.key("classMask")>(); }
  int32_t summary() const { return setting<kind.key("summary")>(); }
  int32_t weightVar() const { return setting<kind.key("weightVar")>(); }

  // The value of a property that shows no key's setting.
  int32_t compute(const OptionProperty& property) const;

 private:
  void adjust(const Settings& given) override;

  int32_t maxLogN = 0;  // after a parse "logN" as it was given, not clamped; after a merge the largest of all
};

}  // namespace senseloom
