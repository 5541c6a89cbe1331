#pragma once

#include <array>
#include <cassert>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <span>

// Integers in the bytes of data records. A record's address has no guaranteed alignment, so every access is a copy.
namespace senseloom {

template <class Integer>
Integer load(std::span<const uint8_t> bytes, size_t offset) {
  assert(offset + sizeof(Integer) <= bytes.size());
  Integer value;
  std::memcpy(&value, bytes.data() + offset, sizeof value);
  return value;
}

template <class Integer>
void store(std::span<uint8_t> bytes, size_t offset, Integer value) {
  assert(offset + sizeof(Integer) <= bytes.size());
  std::memcpy(bytes.data() + offset, &value, sizeof value);
}

inline int16_t loadI16(std::span<const uint8_t> bytes, size_t offset) {
  return load<int16_t>(bytes, offset);
}
inline uint16_t loadU16(std::span<const uint8_t> bytes, size_t offset) {
  return load<uint16_t>(bytes, offset);
}
inline int32_t loadI32(std::span<const uint8_t> bytes, size_t offset) {
  return load<int32_t>(bytes, offset);
}
inline uint64_t loadU64(std::span<const uint8_t> bytes, size_t offset) {
  return load<uint64_t>(bytes, offset);
}
inline void storeU16(std::span<uint8_t> bytes, size_t offset, uint16_t value) {
  store(bytes, offset, value);
}

// Out of line so that the compiler cannot see the bound: it would take a string instruction for the copy, which starts
// far slower than memcpy() does. Few bytes take no call: their first eight and their last, which may overlap.
[[gnu::noinline]] inline void copyAnySize(uint8_t* to, const void* from, size_t size) {
  using Eight = std::array<uint8_t, 8>;
  if (size < sizeof(Eight) || size > 2 * sizeof(Eight)) {
    std::memcpy(to, from, size);
    return;
  }
  const auto* const bytes = static_cast<const uint8_t*>(from);
  Eight first;
  Eight last;
  std::memcpy(&first, bytes, sizeof first);
  std::memcpy(&last, bytes + size - sizeof last, sizeof last);
  std::memcpy(to, &first, sizeof first);
  std::memcpy(to + size - sizeof last, &last, sizeof last);
}

// Copies bytes that most often are `kUsualSize`, which then takes no call.
template <size_t kUsualSize>
void copyBytes(uint8_t* to, const void* from, size_t size) {
  if (size == kUsualSize) {
    std::memcpy(to, from, kUsualSize);
  } else {
    copyAnySize(to, from, size);
  }
}

// The bit of `mask` at `position`, taken modulo 32.
inline bool bitAt(int32_t mask, int32_t position) {
  return (static_cast<uint32_t>(mask) >> (static_cast<uint32_t>(position) & 31U) & 1U) != 0;
}

}  // namespace senseloom
