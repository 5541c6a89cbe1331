#include "sense/text_lines.h"

#include <algorithm>

#include "input_error.h"

namespace senseloom::tool {

TextLines::TextLines(const std::string& file) : name(file == "-" ? "standard input" : file), buffer() {
  try {
    stream = openBytes(file);
  } catch (const InputError& error) {
    throw InputError(name + ": " + error.what());
  }
}

bool TextLines::next(std::string& line) {
  line.clear();
  bool isWhole = false;
  while (!isWhole) {
    if (rest.empty()) rest = {buffer.data(), stream->read(buffer.data(), buffer.size())};
    if (rest.empty()) break;
    const size_t end = std::min(rest.find('\n'), rest.size());
    isWhole = end < rest.size();
    line += rest.substr(0, end);
    rest.remove_prefix(isWhole ? end + 1 : end);
  }
  if (!isWhole && line.empty()) return false;
  ++number;
  if (line.ends_with('\r')) line.pop_back();
  return true;
}

}  // namespace senseloom::tool
