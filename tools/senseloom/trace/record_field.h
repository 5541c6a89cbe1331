#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <optional>
#include <span>

// Single fields of a record's bytes. A record's address has no guaranteed alignment, so every access is a copy.
namespace senseloom::tool {

inline constexpr size_t kTimestampOffset = 0;
inline constexpr size_t kValueOffset = 8;      // the class, the classes, the steps, or the number of items
inline constexpr size_t kElementsOffset = 10;  // of records with a number of items

// Nothing when the record ends before the field does.
template <class Integer>
std::optional<Integer> recordField(std::span<const uint8_t> record, size_t offset) {
  if (record.size() < offset + sizeof(Integer)) return std::nullopt;
  Integer value;
  std::memcpy(&value, record.data() + offset, sizeof value);
  return value;
}

}  // namespace senseloom::tool
