#pragma once

#include <string>
#include <vector>

#include "trace/text_lines.h"

namespace senseloom::tool {

// Reads a table of text a row at a time: cells between commas, one row a line. A cell may stand in double quotes, with
// two for each quote within. Blank lines are skipped.
class CsvReader {
 public:
  // "-" is standard input. Throws InputError when the file cannot be opened.
  explicit CsvReader(const std::string& file) : lines(file) {}

  // The cells of the next row; none at the end. Throws InputError when a quote is not closed on its line.
  std::vector<std::string> next();

  // Where the last row was read, for messages: "FILE:LINE", or the file alone before the first one.
  std::string position() const { return lines.position(); }

 private:
  TextLines lines;
};

}  // namespace senseloom::tool
