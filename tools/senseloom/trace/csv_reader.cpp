#include "trace/csv_reader.h"

#include <string_view>

#include "input_error.h"

namespace senseloom::tool {
namespace {

// Takes a cell off the front of a line, with the comma behind it. `more`: whether there was one.
std::string takeCell(std::string_view& line, bool& more) {
  std::string cell;
  bool quoted = false;
  size_t i = 0;
  for (; i < line.size() && (quoted || line[i] != ','); ++i) {
    if (line[i] != '"') {
      cell += line[i];
    } else if (quoted && i + 1 < line.size() && line[i + 1] == '"') {
      cell += line[i++];
    } else {
      quoted = !quoted;
    }
  }
  if (quoted) throw InputError("a double quote is not closed");
  more = i < line.size();
  line.remove_prefix(more ? i + 1 : i);
  return cell;
}

}  // namespace

std::vector<std::string> CsvReader::next() {
  for (std::string line; lines.next(line);) {
    if (line.find_first_not_of(" \t") == std::string::npos) continue;
    std::vector<std::string> cells;
    std::string_view rest = line;
    for (bool more = true; more;) cells.push_back(takeCell(rest, more));
    return cells;
  }
  return {};
}

}  // namespace senseloom::tool
