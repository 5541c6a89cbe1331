#pragma once

#include "option/described_option.h"

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
inline constexpr OptionProperty kActivityProperties[] = {
    {41, "mode", 0},
    {43, "spans", OptionProperty::kComputed},
    {44, "decisionsPerSpan", OptionProperty::kComputed},
    {42, "classMask", 3},
};
inline constexpr OptionDescription kActivity{
    .sensor = "PHYAC",
    .title = "physical activity",
    .keys = kActivityKeys,
    .properties = kActivityProperties,
    .logTag = kLogTag,
    .note =
        "property 43: 1 << the largest \"logN\" as given, in the high 16 bits; 1 << the smallest in the low 16 bits",
};

class OptionActivity final : public OptionKind<OptionActivity, kActivity> {
 public:
  void merge(const Option& other) override;

  int32_t mode() const { return settings[0]; }
  int32_t logN() const { return settings[1]; }
  int32_t logM() const { return settings[2]; }
  int32_t classMask() const { return settings[3]; }
  int32_t summary() const { return settings[4]; }
  int32_t weightVar() const { return settings[5]; }
  int32_t continuous() const { return settings[6]; }
  int32_t maxLogN() const { return largestLogN; }

 private:
  void adjust(const Values& read) override;
  int32_t computeProperty(int32_t id) const override;

  int32_t largestLogN = 0;
};

}  // namespace senseloom
