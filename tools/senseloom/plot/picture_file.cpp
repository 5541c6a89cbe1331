#include "plot/picture_file.h"

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <memory>
#include <stdexcept>

namespace senseloom::tool {
namespace {

struct CloseFile {
  void operator()(std::FILE* file) const { std::fclose(file); }
};
using File = std::unique_ptr<std::FILE, CloseFile>;

[[noreturn]] void fail(const std::string& name) {
  throw std::runtime_error(name + ": cannot be written: " + std::strerror(errno));
}

File open(const std::string& name, const char* mode) {
  File file(std::fopen(name.c_str(), mode));
  if (file == nullptr) fail(name);
  return file;
}

}  // namespace

void requireWritable(const std::string& file) {
  open(file, "a");
}

void writePicture(const std::string& file, const std::string& picture) {
  File stream = open(file, "w");
  std::fwrite(picture.data(), 1, picture.size(), stream.get());
  const bool isWritten = std::ferror(stream.get()) == 0;
  if (std::fclose(stream.release()) != 0 || !isWritten) fail(file);
}

}  // namespace senseloom::tool
