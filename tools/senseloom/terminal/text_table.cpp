#include "terminal/text_table.h"

#include <algorithm>

namespace senseloom::tool {

void printTable(std::FILE* out, const std::vector<TextRow>& rows, size_t firstOfNumbers) {
  std::vector<size_t> widths;
  for (const TextRow& row : rows) {
    widths.resize(std::max(widths.size(), row.size()));
    for (size_t i = 0; i < row.size(); ++i) widths[i] = std::max(widths[i], row[i].size());
  }
  for (const TextRow& row : rows) {
    std::string line;
    for (size_t i = 0; i < row.size(); ++i) {
      const std::string padding(widths[i] - row[i].size(), ' ');
      line += "  " + (i < firstOfNumbers ? row[i] + padding : padding + row[i]);
    }
    line.erase(line.find_last_not_of(' ') + 1);
    std::fprintf(out, "%s\n", line.c_str());
  }
}

}  // namespace senseloom::tool
