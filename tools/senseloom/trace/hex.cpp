#include "trace/hex.h"

#include <charconv>
#include <cstddef>

namespace senseloom::tool {

void appendHex(std::string& text, std::span<const uint8_t> bytes) {
  static constexpr char kDigits[] = "0123456789abcdef";
  const size_t start = text.size();
  text.resize(start + 2 * bytes.size());
  char* digit = text.data() + start;
  for (const uint8_t byte : bytes) {
    *digit++ = kDigits[byte >> 4];
    *digit++ = kDigits[byte & 15];
  }
}

std::string toHex(std::span<const uint8_t> bytes) {
  std::string digits;
  appendHex(digits, bytes);
  return digits;
}

std::optional<std::vector<uint8_t>> fromHex(std::string_view digits) {
  if (digits.size() % 2 != 0) return std::nullopt;
  std::vector<uint8_t> bytes(digits.size() / 2);
  for (size_t i = 0; i < bytes.size(); ++i) {
    const char* pair = digits.data() + 2 * i;
    if (std::from_chars(pair, pair + 2, bytes[i], 16).ptr != pair + 2) return std::nullopt;
  }
  return bytes;
}

}  // namespace senseloom::tool
