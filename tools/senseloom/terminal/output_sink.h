#pragma once

#include <cstdio>
#include <optional>
#include <string>
#include <string_view>

#include "terminal/new_file.h"

namespace senseloom::tool {

// Throws InputError if a file that is to be written is the one that is read.
void requireOtherFile(const std::string& output, const std::string& input);

// Throws InputError if a file that is to be written holds something already.
void requireEmpty(const std::string& output);

// Where a command writes: a file that gets its name when it is complete, or standard output.
class OutputSink {
 public:
  // An empty `file` is standard output. Throws InputError if the file is `input`, the one that is read, and
  // std::runtime_error if it cannot be written.
  OutputSink(std::FILE* standardOutput, const std::string& file, const std::string& input);

  void write(std::string_view text);
  // Everything is written.
  void commit();

 private:
  std::FILE* out;
  std::optional<NewFile> newFile;
};

}  // namespace senseloom::tool
