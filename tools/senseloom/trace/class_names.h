#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "kinds/sensor_table.h"

namespace senseloom::tool {

// Names of classes, from class 0 on.
using ClassNames = std::vector<std::string>;

// The names in "A,B,...", or those in a file of that name, one a line. Throws InputError if there is none.
ClassNames readClassNames(const std::string& text);

// The name of a class: of these, or else that which the sensor's classes have; empty if there is none.
std::string className(const Sensor& sensor, const ClassNames& names, int64_t number);

}  // namespace senseloom::tool
