#pragma once

#include <initializer_list>
#include <string>
#include <utility>

// An option string of integer settings, at least one: optionText({{"logN", 3}, {"mode", 1}}).
inline std::string optionText(std::initializer_list<std::pair<const char*, int>> settings) {
  std::string text;
  for (const auto& [key, value] : settings) {
    text += text.empty() ? '{' : ',';
    text += '"';
    text += key;
    text += "\":";
    text += std::to_string(value);
  }
  text += '}';
  return text;
}
