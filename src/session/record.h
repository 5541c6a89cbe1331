#pragma once

#include <cstddef>
#include <cstdint>
#include <span>

#include "bytes.h"

// The header that all data records and results begin with: 8 bytes of timestamp, which sessions copy or compare but
// never interpret, and a 16-bit value (of some kinds a 32-bit one) that depends on the kind.
namespace senseloom {

inline constexpr size_t kTimestampOffset = 0;
inline constexpr size_t kTimestampSize = 8;
inline constexpr size_t kValueOffset = 8;
inline constexpr size_t kHeaderSize = 10;  // the payload starts here

inline std::span<const uint8_t> recordBytes(const void* data, int len) {
  return {static_cast<const uint8_t*>(data), static_cast<size_t>(len)};
}

}  // namespace senseloom
