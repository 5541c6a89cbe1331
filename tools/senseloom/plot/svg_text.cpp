#include "plot/svg_text.h"

#include <array>
#include <cmath>
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
