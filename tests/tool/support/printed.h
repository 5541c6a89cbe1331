#pragma once

#include <cstdio>
#include <string>

namespace senseloom::tool {

// What `print` writes to the file that it is given.
template <class Print>
std::string printed(Print print) {
  std::FILE* file = std::tmpfile();
  print(file);
  std::string text(static_cast<size_t>(std::ftell(file)), '\0');
  std::rewind(file);
  text.resize(std::fread(text.data(), 1, text.size(), file));
  std::fclose(file);
  return text;
}

}  // namespace senseloom::tool
