#pragma once

#include <cstdio>
#include <string>

namespace senseloom::tool {

// Prints what can be asked of a sensor, or of all when `sensor` is empty: the keys of its option string with defaults,
// ranges, merge rules and what they mean; its properties; and the fields of its records. Throws InputError when there
// is no such sensor.
void printSensors(std::FILE* out, const std::string& sensor);

// The same as JSON: one object per line and sensor.
void printSensorsJson(std::FILE* out, const std::string& sensor);

}  // namespace senseloom::tool
