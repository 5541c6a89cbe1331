#pragma once

#include <array>
#include <cstddef>
#include <memory>
#include <string>
#include <string_view>

#include "trace/byte_stream.h"

namespace senseloom::tool {

// Reads a text a line at a time, from a file or standard input, plain or compressed. A byte order mark is left out.
class TextLines {
 public:
  // "-" is standard input. Throws InputError, with the name, when the file cannot be opened.
  explicit TextLines(const std::string& file);

  // Reads the next line, without its end. False at the end of the text. Throws InputError when it cannot be read.
  bool next(std::string& line);

  // Where the last line was read, for messages: "FILE:LINE", or the file alone before the first one.
  std::string position() const;
  // The number of the last line, from 1 on.
  size_t lineNumber() const { return number; }

 private:
  const std::string name;
  std::unique_ptr<ByteStream> stream;
  std::array<char, 16384> buffer;
  std::string_view rest;  // of the buffer
  size_t number = 0;
};

}  // namespace senseloom::tool
