#include "watch/screen_text.h"

#include <algorithm>

namespace senseloom::tool {
namespace {

constexpr char kEllipsis[] = "\u2026";

// Bytes that continue a character.
bool isContinuation(char byte) {
  return (static_cast<unsigned char>(byte) & 0xC0) == 0x80;
}

std::string blanks(size_t width, const std::string& text) {
  return std::string(width - std::min(width, widthOf(text)), ' ');
}

}  // namespace

size_t widthOf(std::string_view text) {
  return text.size() - static_cast<size_t>(std::count_if(text.begin(), text.end(), isContinuation));
}

std::string harmless(std::string_view text) {
  std::string clean(text);
  for (size_t i = 0; i < clean.size(); ++i) {
    const auto byte = static_cast<unsigned char>(clean[i]);
    if (byte < 0x20 || byte == 0x7F) clean[i] = ' ';
    // U+0080 to U+009F
    const bool isControl = byte == 0xC2 && i + 1 < clean.size() && static_cast<unsigned char>(clean[i + 1]) < 0xA0;
    if (isControl) clean.replace(i, 2, " ");
  }
  return clean;
}

std::string shortenedTo(size_t width, const std::string& text) {
  if (widthOf(text) <= width) return text;
  if (width == 0) return "";
  size_t end = 0;
  for (size_t kept = 0; kept < width; ++end) kept += isContinuation(text[end]) ? 0 : 1;
  // `end` is behind the first byte of the last character that would fit; the ellipsis takes its place.
  return text.substr(0, end - 1) + kEllipsis;
}

void removeLastCharacter(std::string& text) {
  while (!text.empty() && isContinuation(text.back())) text.pop_back();
  if (!text.empty()) text.pop_back();
}

std::string paddedBehind(size_t width, const std::string& text) {
  return text + blanks(width, text);
}

std::string paddedInFront(size_t width, const std::string& text) {
  return blanks(width, text) + text;
}

}  // namespace senseloom::tool
