#pragma once

#include <cstddef>
#include <string_view>
#include <vector>

namespace senseloom::model {

// The Levenshtein distance: how many characters have to be inserted, deleted or replaced.
size_t editDistance(std::string_view from, std::string_view to);

// The name with the least edit distance, whether letters are capitals or not, and the first of several; empty when
// there are no names.
std::string_view nearestName(std::string_view name, const std::vector<std::string_view>& names);

}  // namespace senseloom::model
