#include "nearest_name.h"

#include <algorithm>
#include <numeric>
#include <string>
#include <utility>

namespace senseloom::model {
namespace {

std::string inLowerCase(std::string_view name) {
  std::string text(name);
  for (char& c : text) {
    if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
  }
  return text;
}

}  // namespace

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
  const std::string wanted = inLowerCase(name);
  const auto distance = [&wanted](std::string_view one) { return editDistance(wanted, inLowerCase(one)); };
  const auto nearest = std::min_element(
      names.begin(), names.end(),
      [&distance](std::string_view left, std::string_view right) { return distance(left) < distance(right); });
  return nearest == names.end() ? std::string_view() : *nearest;
}

}  // namespace senseloom::model
