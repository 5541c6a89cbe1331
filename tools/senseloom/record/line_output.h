#pragma once

#include <memory>
#include <string>
#include <string_view>

namespace senseloom::tool {

// Where the lines of a recording go that passes through the tool. All functions throw std::runtime_error when it cannot
// be written.
class LineOutput {
 public:
  virtual ~LineOutput() = default;
  virtual void write(std::string_view lines) = 0;
  // So that what was written can be read, whatever becomes of the tool.
  virtual void flush() {}
  // There is no more. Until then a file has ".part" behind its name.
  virtual void finish() {}
};

// A descriptor that stays open.
std::unique_ptr<LineOutput> makeStreamOutput(int descriptor);

// A new file, compressed as its name ends: in ".gz" by gzip, in ".zst" by zstd.
bool isCompressed(std::string_view file);
std::unique_ptr<LineOutput> makeCompressedOutput(const std::string& file);

}  // namespace senseloom::tool
