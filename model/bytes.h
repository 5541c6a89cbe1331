#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <span>
#include <vector>

// Integers within records and masks.
namespace senseloom::model {

using Bytes = std::vector<uint8_t>;
using Record = std::span<const uint8_t>;

// Where a record has its timestamp, and its class, classes, steps or number of items.
inline constexpr size_t kTimestampOffset = 0;
inline constexpr size_t kValueOffset = 8;
inline constexpr size_t kItemsOffset = 10;

template <class Integer>
bool has(Record record, size_t offset) {
  return record.size() >= offset + sizeof(Integer);
}

template <class Integer>
Integer at(Record record, size_t offset) {
  Integer value;
  std::memcpy(&value, record.data() + offset, sizeof value);
  return value;
}

// Positions of bits and shift counts use their low 5 bits.
inline bool bit(int32_t mask, int64_t position) {
  return (static_cast<uint32_t>(mask) >> (position & 31) & 1U) != 0;
}
inline int32_t shifted(int32_t value, int32_t count) {
  return static_cast<int32_t>(static_cast<uint32_t>(value) << (static_cast<uint32_t>(count) & 31U));
}

}  // namespace senseloom::model
