#include "nearest_name.h"

#include <algorithm>
#include <numeric>
#include <utility>

namespace senseloom::model {

size_t editDistance(std::string_view from, std::string_view to) {
  // One row of the table of distances: [j] is that of what was seen of `from` to the first j characters of `to`.
  std::vector<size_t> row(to.size() + 1);
  std::iota(row.begin(), row.end(), size_t{0});
  for (const char character : from) {
    size_t diagonal = row[0]++;
    for (size_t j = 1; j < row.size(); ++j) {
      const size_t replaced = diagonal + (character == to[j - 1] ? 0 : 1);
      diagonal = std::exchange(row[j], std::min({replaced, row[j] + 1, row[j - 1] + 1}));
    }
  }
  return row.back();
}

std::string_view nearestName(std::string_view name, const std::vector<std::string_view>& names) {
  const auto nearest =
      std::min_element(names.begin(), names.end(), [name](std::string_view left, std::string_view right) {
        return editDistance(name, left) < editDistance(name, right);
      });
  return nearest == names.end() ? std::string_view() : *nearest;
}

}  // namespace senseloom::model
