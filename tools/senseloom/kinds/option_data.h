#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <string_view>

#include "option/option_description.h"

// The library's descriptions of its options, which are data. Otherwise the tool uses the library through its public
// interface alone.
namespace senseloom::tool {

// One description a sensor.
std::span<const OptionDescription* const> optionDescriptions();
// Null when there is no such sensor.
const OptionDescription* findOptionDescription(std::string_view sensor);

// The name of a sensor's property; "?" when the sensor has no property of that id.
const char* propertyName(std::string_view sensor, int32_t id);

// For people: "any", "none", or the bounds.
std::string rangeText(const Range& range);
const char* mergeText(Merge merge);

}  // namespace senseloom::tool
