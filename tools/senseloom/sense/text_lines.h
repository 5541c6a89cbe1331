#pragma once

#include <zlib.h>

#include <cstddef>
#include <memory>
#include <string>
#include <type_traits>

namespace senseloom::tool {

// Reads a text a line at a time, from a file or standard input, plain or compressed by gzip.
class TextLines {
 public:
  // "-" is standard input. Throws InputError when the file cannot be opened.
  explicit TextLines(const std::string& file);

  // Reads the next line, without its end. False at the end of the text. Throws InputError when it cannot be read.
  bool next(std::string& line);

  // The file, for messages.
  const std::string& fileName() const { return name; }
  // The number of the last line, from 1 on.
  size_t lineNumber() const { return number; }

 private:
  struct Close {
    void operator()(gzFile file) const { gzclose(file); }
  };

  const std::string name;
  std::unique_ptr<std::remove_pointer_t<gzFile>, Close> stream;
  size_t number = 0;
};

}  // namespace senseloom::tool
