#include "sense/text_lines.h"

#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstring>

#include "input_error.h"

namespace senseloom::tool {

TextLines::TextLines(const std::string& file)
    : name(file == "-" ? "standard input" : file),
      stream(file == "-" ? gzdopen(dup(STDIN_FILENO), "rb") : gzopen(file.c_str(), "rb")) {
  if (stream == nullptr) throw InputError(name + ": " + std::strerror(errno));
}

bool TextLines::next(std::string& line) {
  line.clear();
  std::array<char, 4096> part;
  while (gzgets(stream.get(), part.data(), part.size()) != nullptr) {
    line += part.data();
    if (line.ends_with('\n')) break;
  }
  int error = Z_OK;
  const char* const reason = gzerror(stream.get(), &error);
  if (error != Z_OK && error != Z_STREAM_END) {
    throw InputError(name + ": " + (error == Z_ERRNO ? std::strerror(errno) : reason));
  }
  if (line.empty()) return false;
  ++number;
  while (line.ends_with('\n') || line.ends_with('\r')) line.pop_back();
  return true;
}

}  // namespace senseloom::tool
