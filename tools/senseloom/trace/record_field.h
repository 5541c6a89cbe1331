#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <optional>
#include <span>

// Single fields of a record's bytes. A record's address has no guaranteed alignment, so every access is a copy.
namespace senseloom::tool {

inline constexpr size_t kTimestampOffset = 0;
inline constexpr size_t kValueOffset = 8;   // the class, the classes, the steps, or the number of items
inline constexpr size_t kItemsOffset = 10;  // of a record that counts its items

// Nothing when the record ends before the field does.
template <class Integer>
std::optional<Integer> recordField(std::span<const uint8_t> record, size_t offset) {
  if (record.size() < offset + sizeof(Integer)) return std::nullopt;
  Integer value;
  std::memcpy(&value, record.data() + offset, sizeof value);
  return value;
}

// The record has room for the field.
template <class Integer>
void setRecordField(std::span<uint8_t> record, size_t offset, Integer value) {
  std::memcpy(record.data() + offset, &value, sizeof value);
}

}  // namespace senseloom::tool
