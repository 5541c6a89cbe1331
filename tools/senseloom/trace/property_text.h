#pragma once

#include <span>
#include <string>

#include "trace/replayer.h"

// Properties and bytes, for people.
namespace senseloom::tool {

// The first bytes in hexadecimal, and how many there are.
std::string bytesText(std::span<const uint8_t> bytes);

// An integer, or bytes.
std::string valueText(const Property& property);
// The same, with the two halves of a value that has two.
std::string valueText(const Sensor& sensor, const Property& property);

}  // namespace senseloom::tool
