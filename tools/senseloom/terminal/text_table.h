#pragma once

#include <cstddef>
#include <cstdio>
#include <limits>
#include <string>
#include <vector>

namespace senseloom::tool {

using TextRow = std::vector<std::string>;

// Prints rows with equal numbers of cells as a table, indented by two blanks, each column as wide as its widest cell.
// Columns from `firstOfNumbers` on are aligned to the right.
void printTable(std::FILE* out, const std::vector<TextRow>& rows,
                size_t firstOfNumbers = std::numeric_limits<size_t>::max());

}  // namespace senseloom::tool
