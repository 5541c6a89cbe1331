#include "trace/text_lines.h"

#include <algorithm>

#include "input_error.h"
#include "trace/byte_order_mark.h"

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
  if (++number == 1 && line.starts_with(kByteOrderMark)) line.erase(0, kByteOrderMark.size());
  if (line.ends_with('\r')) line.pop_back();
  return true;
}

std::string TextLines::position() const {
  return number == 0 ? name : name + ':' + std::to_string(number);
}

}  // namespace senseloom::tool
