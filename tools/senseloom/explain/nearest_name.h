#pragma once

#include <cstddef>
#include <string_view>
#include <vector>

namespace senseloom::tool {

// The fewest characters to insert, delete or replace that make one text of the other.
size_t editDistance(std::string_view from, std::string_view to);

// The name with the least edit distance, of several the first; empty when there are no names.
std::string_view nearestName(std::string_view name, const std::vector<std::string_view>& names);

}  // namespace senseloom::tool
