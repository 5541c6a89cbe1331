#pragma once

#include "option/described_option.h"

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
    {181, "userHeight", 0}, {182, "floorHeight", 1}, {183, "initX", 2}, {184, "initY", 3},
    {185, "initFloor", 4},  {186, "N", 5},           {187, "6DOF", 6},
};
inline constexpr OptionDescription kPDR{
    .sensor = "PDR",
    .title = "pedestrian dead reckoning",
    .keys = kPDRKeys,
    .properties = kPDRProperties,
    .logTag = kLogTag,
};
class OptionPDR final : public OptionKind<OptionPDR, kPDR> {
 public:
  int32_t userHeight() const { return settings[0]; }
  int32_t floorHeight() const { return settings[1]; }
  int32_t initX() const { return settings[2]; }
  int32_t initY() const { return settings[3]; }
  int32_t initFloor() const { return settings[4]; }
  int32_t N() const { return settings[5]; }
  int32_t sixDOF() const { return settings[6]; }
};

}  // namespace senseloom
