#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <vector>

#include "kinds/sensor_table.h"
#include "sweep/sweep_grid.h"

namespace senseloom::tool {

// What the library does with a combination that its client may not expect, in words: it replaces a value, or refuses
// the option. Empty if it takes all values as they are. `head` is the client's option before the members of the
// combination; what is replaced in it anyway, whatever the combination, is left out.
std::vector<std::string> remarksOn(const Sensor& sensor, const std::string& head, const SweepGrid& grid,
                                   size_t combination);

}  // namespace senseloom::tool
