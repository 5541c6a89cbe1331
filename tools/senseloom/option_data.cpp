#include "option_data.h"

#include <algorithm>
#include <iterator>

#include "option/option_kinds.h"

namespace senseloom::tool {

std::span<const OptionDescription* const> optionDescriptions() {
  return kOptionKinds;
}

const OptionDescription* findOptionDescription(std::string_view sensor) {
  const auto* const* found = std::find_if(std::begin(kOptionKinds), std::end(kOptionKinds),
                                          [sensor](const OptionDescription* kind) { return kind->sensor == sensor; });
  return found == std::end(kOptionKinds) ? nullptr : *found;
}

const char* propertyName(std::string_view sensor, int32_t id) {
  const OptionDescription* kind = findOptionDescription(sensor);
  if (kind == nullptr) return "?";
  const auto found = std::find_if(kind->properties.begin(), kind->properties.end(),
                                  [id](const OptionProperty& property) { return property.id == id; });
  return found == kind->properties.end() ? "?" : found->name;
}

}  // namespace senseloom::tool
