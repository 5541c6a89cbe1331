#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace senseloom::tool {

// Bytes as lowercase hexadecimal digits, two a byte, high nibble first.
std::string toHex(std::span<const uint8_t> bytes);
void appendHex(std::string& text, std::span<const uint8_t> bytes);

// The bytes of such digits, in either case; nothing if a character is not a digit or their number is odd.
std::optional<std::vector<uint8_t>> fromHex(std::string_view digits);

}  // namespace senseloom::tool
