#include "plot/picture_file.h"

#include <array>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <stdexcept>

#include "input_error.h"
#include "terminal/new_file.h"
#include "terminal/output_sink.h"

namespace senseloom::tool {
namespace {

constexpr char kDrawer[] = "rsvg-convert";

struct CloseFile {
  void operator()(std::FILE* file) const { std::fclose(file); }
};

bool isPng(const std::string& file) {
  return file.ends_with(".png");
}

NewFile newPicture(const std::string& file) {
  return {file, 0666, NewFile::Rest::removed};
}

// Draws a picture with a program that reads it and writes it as PNG.
std::string drawn(const std::string& file, const std::string& svg) {
  const std::unique_ptr<std::FILE, CloseFile> source(std::tmpfile());
  if (source == nullptr || std::fwrite(svg.data(), 1, svg.size(), source.get()) != svg.size() ||
      std::fflush(source.get()) != 0) {
    throw std::runtime_error(file + ": cannot be drawn: there is no room for a temporary file");
  }
  const std::string command = std::string(kDrawer) + " --format=png </dev/fd/" + std::to_string(fileno(source.get()));
  std::FILE* const program = popen(command.c_str(), "r");
  std::string png;
  std::array<char, 65536> buffer;
  while (program != nullptr) {
    const size_t count = std::fread(buffer.data(), 1, buffer.size(), program);
    if (count == 0) break;
    png.append(buffer.data(), count);
  }
  if (program == nullptr || pclose(program) != 0) throw std::runtime_error(file + ": " + kDrawer + " failed");
  return png;
}

}  // namespace

void requireWritable(const std::string& file, std::span<const std::string> inputs) {
  for (const std::string& input : inputs) requireOtherFile(file, input);
  if (isPng(file) && std::system((std::string("command -v ") + kDrawer + " >/dev/null 2>&1").c_str()) != 0) {
    throw InputError(file + ": takes the program " + kDrawer +
                     ", which is not here (Debian's package librsvg2-bin); write an .svg instead");
  }
  newPicture(file);
}

void writePicture(const std::string& file, const std::string& svg) {
  NewFile picture = newPicture(file);
  picture.write(isPng(file) ? drawn(file, svg) : svg);
  picture.commit();
}

}  // namespace senseloom::tool
