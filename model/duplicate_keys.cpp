#include "duplicate_keys.h"

#include <jansson.h>

#include <algorithm>

namespace senseloom::model {
namespace {

// The position of the quote that ends the string which begins at `start`.
size_t endOfString(std::string_view text, size_t start) {
  size_t end = start + 1;
  while (text[end] != '"') end += text[end] == '\\' ? 2 : 1;
  return end;
}

// What a string with its quotes holds.
std::string unescaped(std::string_view string) {
  json_t* json = json_loadb(string.data(), string.size(), JSON_DECODE_ANY, nullptr);
  const std::string text = json_string_value(json);
  json_decref(json);
  return text;
}

}  // namespace

std::vector<std::string> keysGivenTwice(std::string_view text) {
  std::vector<std::string> seen;
  std::vector<std::string> twice;
  const auto has = [](auto& names, auto& name) { return std::find(names.begin(), names.end(), name) != names.end(); };
  int depth = 0;
  for (size_t i = 0; i < text.size(); ++i) {
    if (text[i] == '{' || text[i] == '[') ++depth;
    if (text[i] == '}' || text[i] == ']') --depth;
    if (text[i] != '"') continue;
    const size_t end = endOfString(text, i);
    const std::string_view string = text.substr(i, end + 1 - i);
    i = end;
    if (depth != 1 || text[text.find_first_not_of(" \t\r\n", end + 1)] != ':') continue;
    const std::string key = unescaped(string);
    if (!has(seen, key)) {
      seen.push_back(key);
    } else if (!has(twice, key)) {
      twice.push_back(key);
    }
  }
  return twice;
}

}  // namespace senseloom::model
