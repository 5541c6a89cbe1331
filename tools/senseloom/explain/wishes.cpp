#include "explain/wishes.h"

#include <algorithm>
#include <cstddef>

namespace senseloom::tool {

std::string Wish::text() const {
  const std::string number = std::to_string(value);
  if (asked != value) return number + " for " + (isDefault ? "default " : "") + std::to_string(asked);
  return isDefault ? number + " default" : number;
}

Wishes::Wishes(const OptionDescription& description) : described(&description) {
  for (const OptionKey& key : description.keys) {
    wishes.push_back({.value = key.defaultValue, .asked = key.defaultValue, .isDefault = true});
  }
}

const Wish& Wishes::operator[](std::string_view key) const {
  const auto found = std::find_if(described->keys.begin(), described->keys.end(),
                                  [key](const OptionKey& known) { return known.name == key; });
  return wishes.at(static_cast<size_t>(found - described->keys.begin()));
}

Wish& Wishes::operator[](std::string_view key) {
  return const_cast<Wish&>(static_cast<const Wishes&>(*this)[key]);
}

}  // namespace senseloom::tool
