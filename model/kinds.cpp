#include "kinds.h"

#include <algorithm>
#include <iterator>

namespace senseloom::model {

int kindNamed(std::string_view sensor) {
  const auto* found =
      std::find_if(std::begin(kKindTable), std::end(kKindTable), [&](auto& row) { return row.sensor == sensor; });
  return found == std::end(kKindTable) ? -1 : static_cast<int>(found - std::begin(kKindTable));
}

size_t keyIndex(int kind, std::string_view key) {
  const auto& keys = rowOf(kind).keys;
  return static_cast<size_t>(std::find_if(keys.begin(), keys.end(), [&](auto& row) { return row.name == key; }) -
                             keys.begin());
}

}  // namespace senseloom::model
