#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <vector>

namespace senseloom::tool {

// Integers as the page reads them: seven bits a byte, the lowest first, with the high bit set in all but the last byte.
class PackedNumbers {
 public:
  void add(uint64_t value);
  // Small negative numbers take few bytes, too.
  void addSigned(int64_t value);
  void clear() { content.clear(); }
  std::span<const uint8_t> bytes() const { return content; }

 private:
  std::vector<uint8_t> content;
};

// Bytes as the letters of base64.
std::string base64(std::span<const uint8_t> bytes);

}  // namespace senseloom::tool
