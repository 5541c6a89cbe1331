#pragma once

#include "option/integer_option.h"

namespace senseloom {

// Marks a starting position or floor that the client did not give.
inline constexpr int32_t kNotGiven = 32767;

// The defaults of userHeight, floorHeight and 6DOF lie outside their ranges on purpose: a string that leaves such a key
// out has the default logged as rejected, and keeps it.
inline constexpr OptionKey kPDRKeys[] = {
    {.name = "userHeight", .defaultValue = 1000, .range = {100, 300}, .message = "PDR: invalid user height value %d"},
    {.name = "floorHeight", .defaultValue = 5000, .range = {200, 800}, .message = "PDR: invalid floor height value %d"},
    {.name = "initX", .defaultValue = kNotGiven},
    {.name = "initY", .defaultValue = kNotGiven},
    {.name = "initFloor", .defaultValue = kNotGiven},
    {.name = "N", .range = {0, 6}, .message = "PDR: invalid N value %d", .merge = Merge::minimum},
    {.name = "6DOF", .defaultValue = 2, .range = {0, 1}, .message = "PDR: invalid 6DOF value %d"},
};
inline constexpr OptionProperty kPDRProperties[] = {
    {181, "userHeight"}, {182, "floorHeight"}, {183, "initX"}, {184, "initY"},
    {185, "initFloor"},  {186, "N"},           {187, "6DOF"},
};
inline constexpr OptionDescription kPDR{
    .sensor = "PDR",
    .title = "pedestrian dead reckoning",
    .keys = kPDRKeys,
    .properties = kPDRProperties,
    .logTag = kLogTag,
};
class OptionPDR final : public IntegerOption<OptionPDR, kPDR> {
 public:
  int32_t N() const { return setting<kind.key("N")>(); }
};

}  // namespace senseloom
