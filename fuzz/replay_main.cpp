// Runs a fuzz target on all files of a folder, or on one file, without a fuzzer: replay_corpus TARGET PATH...

#include <algorithm>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include "target.h"

namespace {

constexpr struct {
  const char* name;
  void (*run)(const uint8_t* data, size_t size);
} kTargets[] = {{"options", fuzz::options},
                {"records", fuzz::records},
                {"sequences", fuzz::sequences},
                {"gesture", fuzz::gesture},
                {"hub", fuzz::hub}};

std::vector<std::filesystem::path> filesOf(const std::vector<std::filesystem::path>& paths) {
  std::vector<std::filesystem::path> files;
  for (const auto& path : paths) {
    if (!std::filesystem::is_directory(path)) {
      files.push_back(path);
      continue;
    }
    for (const auto& entry : std::filesystem::directory_iterator(path)) files.push_back(entry.path());
  }
  std::sort(files.begin(), files.end());
  return files;
}

}  // namespace

int main(int argc, char** argv) {
  const std::vector<std::string> arguments(argv + 1, argv + argc);
  const auto* target = std::find_if(std::begin(kTargets), std::end(kTargets), [&](const auto& known) {
    return !arguments.empty() && arguments[0] == known.name;
  });
  const auto files = arguments.empty() ? filesOf({}) : filesOf({arguments.begin() + 1, arguments.end()});
  if (target == std::end(kTargets) || files.empty()) {
    std::fputs("usage: replay_corpus options|records|sequences|gesture|hub PATH...\n", stderr);
    return 2;
  }
  for (const auto& file : files) {
    std::printf("%s\n", file.c_str());
    std::fflush(stdout);  // the last line names the input that ended the program
    std::ifstream stream(file, std::ios::binary);
    const std::vector<char> bytes{std::istreambuf_iterator<char>(stream), {}};
    // A block of its own for each input, exactly as large, so that a sanitizer sees any access beyond it.
    target->run(reinterpret_cast<const uint8_t*>(bytes.data()), bytes.size());
  }
  return 0;
}
