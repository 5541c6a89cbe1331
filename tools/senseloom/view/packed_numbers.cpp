#include "view/packed_numbers.h"

#include <algorithm>
#include <cstddef>

namespace senseloom::tool {

void PackedNumbers::add(uint64_t value) {
  for (; value > 127; value >>= 7) content.push_back(static_cast<uint8_t>(value & 127) | 128);
  content.push_back(static_cast<uint8_t>(value));
}

void PackedNumbers::addSigned(int64_t value) {
  const uint64_t twice = static_cast<uint64_t>(value) << 1;
  add(value < 0 ? ~twice : twice);
}

std::string base64(std::span<const uint8_t> bytes) {
  constexpr char kLetters[] = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
  std::string text;
  text.reserve((bytes.size() + 2) / 3 * 4);
  for (size_t i = 0; i < bytes.size(); i += 3) {
    const size_t count = std::min<size_t>(3, bytes.size() - i);
    uint32_t group = 0;
    for (size_t j = 0; j < 3; ++j) group = group << 8 | (j < count ? bytes[i + j] : 0U);
    for (size_t j = 0; j < 4; ++j) text += j <= count ? kLetters[group >> (18 - 6 * j) & 63] : '=';
  }
  return text;
}

}  // namespace senseloom::tool
