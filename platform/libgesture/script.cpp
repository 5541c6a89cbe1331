#include "script.h"

#include <fstream>
#include <utility>

namespace gesture {

std::optional<Script> Script::read(const char* path) {
  std::ifstream file(path);
  Script script;
  for (std::string line; std::getline(file, line);) script.lines.push_back(std::move(line));
  if (!file.eof()) return std::nullopt;
  return script;
}

const char* Script::take(const std::int16_t*, bool last) {
  if (!last || nextRecord == lines.size()) return nullptr;
  const std::string& name = lines[nextRecord++];
  return name.empty() ? nullptr : name.c_str();
}

}  // namespace gesture
