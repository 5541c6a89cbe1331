#include "kinds/option_data.h"

#include <algorithm>
#include <iterator>

#include "option/all_options.h"

namespace senseloom::tool {

std::span<const OptionDescription* const> optionDescriptions() {
  return kOptionDescriptions;
}

const OptionDescription* findOptionDescription(std::string_view sensor) {
  const auto* const* found = std::find_if(std::begin(kOptionDescriptions), std::end(kOptionDescriptions),
                                          [sensor](const OptionDescription* kind) { return kind->sensor == sensor; });
  return found == std::end(kOptionDescriptions) ? nullptr : *found;
}

const char* propertyName(std::string_view sensor, int32_t id) {
  const OptionDescription* kind = findOptionDescription(sensor);
  if (kind == nullptr) return "?";
  const auto found = std::find_if(kind->properties.begin(), kind->properties.end(),
                                  [id](const OptionProperty& property) { return property.id == id; });
  return found == kind->properties.end() ? "?" : found->name;
}

std::string rangeText(const Range& range) {
  if (range.low > range.high) return "none";
  const bool isOpenBelow = range.low == kAnyValue.low;
  const bool isOpenAbove = range.high == kAnyValue.high;
  if (isOpenBelow && isOpenAbove) return "any";
  return (isOpenBelow ? "" : std::to_string(range.low)) + ".." + (isOpenAbove ? "" : std::to_string(range.high));
}

const char* mergeText(Merge merge) {
  switch (merge) {
    case Merge::bitOr:
      return "bitwise or";
    case Merge::minimum:
      return "minimum";
    case Merge::maximum:
      return "maximum";
    case Merge::allOne:
      return "1 when all are 1";
    case Merge::anySet:
      return "1 when any is not 0";
    case Merge::keepFirst:
      return "the one that started the merge";
    case Merge::takeLast:
      return "the last one opened";
  }
  return "";
}

}  // namespace senseloom::tool
