#include "trace/csv_reader.h"

#include <cerrno>
#include <cstring>
#include <iostream>

#include "input_error.h"
#include "trace/byte_order_mark.h"

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

CsvReader::CsvReader(const std::string& file)
    : name(file == "-" ? "standard input" : file), input(file == "-" ? &std::cin : &stream) {
  if (file == "-") return;
  stream.open(file);
  if (!stream) throw InputError(name + ": " + std::strerror(errno));
}

std::vector<std::string> CsvReader::next() {
  for (std::string line; std::getline(*input, line);) {
    ++lineNumber;
    if (lineNumber == 1 && line.starts_with(kByteOrderMark)) line.erase(0, kByteOrderMark.size());
    if (!line.empty() && line.back() == '\r') line.pop_back();
    if (line.find_first_not_of(" \t") == std::string::npos) continue;
    std::vector<std::string> cells;
    std::string_view rest = line;
    for (bool more = true; more;) cells.push_back(takeCell(rest, more));
    return cells;
  }
  if (input->bad()) throw InputError("cannot be read");
  return {};
}

std::string CsvReader::position() const {
  return lineNumber == 0 ? name : name + ':' + std::to_string(lineNumber);
}

}  // namespace senseloom::tool
