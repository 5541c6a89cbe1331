#include "plot/svg_text.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstddef>
#include <cstdio>

namespace senseloom::tool {

std::string xmlText(std::string_view text) {
  std::string result;
  for (size_t i = 0; i < text.size(); ++i) {
    const char c = text[i];
    // U+FFFE and U+FFFF, in three bytes.
    if (text.substr(i, 2) == "\xEF\xBF" && i + 2 < text.size() && static_cast<unsigned char>(text[i + 2]) >= 0xBE) {
      result += '?';
      i += 2;
    } else if (c == '&') {
      result += "&amp;";
    } else if (c == '<') {
      result += "&lt;";
    } else if (c == '>') {
      result += "&gt;";
    } else if (c == '"') {
      result += "&quot;";
    } else {
      result += static_cast<unsigned char>(c) < ' ' ? '?' : c;
    }
  }
  return result;
}

std::string shortened(std::string_view text, size_t most) {
  size_t characters = 0;
  for (size_t i = 0; i < text.size(); ++i) {
    const bool begins = (static_cast<unsigned char>(text[i]) & 0xC0) != 0x80;
    if (begins && characters++ == most) return std::string(text.substr(0, i)) + "...";
  }
  return std::string(text);
}

std::vector<std::string> shortenedApart(const std::vector<std::string>& names) {
  constexpr std::ptrdiff_t kMost = 17;
  constexpr size_t kKept = 6;  // at each end
  const auto beginsCharacter = [](char c) { return (static_cast<unsigned char>(c) & 0xC0) != 0x80; };
  std::vector<std::string> result;
  for (const std::string& name : names) {
    std::string text = name;
    if (std::ranges::count_if(name, beginsCharacter) > kMost) {
      size_t tail = name.size();
      for (size_t kept = 0; kept < kKept; kept += beginsCharacter(name[tail]) ? 1 : 0) --tail;
      text = shortened(name, kKept) + name.substr(tail);
    }
    const auto isLike = [&text](const std::string& other) { return other == text || other.starts_with(text + " ("); };
    const auto same = std::ranges::count_if(result, isLike);
    result.push_back(same == 0 ? text : text + " (" + std::to_string(same + 1) + ')');
  }
  return result;
}

std::string coordinate(double value) {
  std::array<char, 32> text;
  std::snprintf(text.data(), text.size(), "%.1f", value);
  std::string number = text.data();
  if (number.ends_with(".0")) number.resize(number.size() - 2);
  return number;
}

std::string grouped(uint64_t number) {
  std::string digits = std::to_string(number);
  for (size_t i = digits.size(); i > 3; i -= 3) digits.insert(i - 3, 1, ',');
  return digits;
}

double axisStep(double span, int most) {
  const double least = span / most;
  const double power = std::pow(10, std::floor(std::log10(least)));
  for (const double factor : {1, 2, 5}) {
    if (factor * power >= least) return factor * power;
  }
  return 10 * power;
}

}  // namespace senseloom::tool
