#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <vector>

// The inputs of all measurements: records of one size, back to back, the same in every run.
namespace bench {

class Records {
 public:
  Records(size_t records, size_t recordSize) : bytes(records * recordSize), stride(recordSize) {}

  size_t count() const { return bytes.size() / stride; }
  int size() const { return static_cast<int>(stride); }  // bytes of a record
  uint8_t* at(size_t index) { return bytes.data() + index * stride; }
  uint8_t* begin() { return bytes.data(); }
  uint8_t* end() { return bytes.data() + bytes.size(); }

 private:
  std::vector<uint8_t> bytes;
  size_t stride;
};

// All records begin with 8 bytes of timestamp and a 16-bit value, which is a class or a number of items that follow.
inline constexpr size_t kTimestampSize = 8;
inline constexpr size_t kValueOffset = 8;
inline constexpr size_t kHeaderSize = 10;
inline constexpr size_t kDeadReckoningItem = 28;  // bytes

inline int16_t valueAt(const void* bytes) {
  int16_t value;
  std::memcpy(&value, bytes, sizeof value);
  return value;
}
inline int16_t valueOf(const uint8_t* record) {
  return valueAt(record + kValueOffset);
}

inline constexpr size_t kRecords = 1024;  // of a set: a multiple of every batch
inline constexpr int kFlickClasses = 6;

// Flick gestures of the classes 1 to 6: one after the other, which a processor predicts, or by chance.
Records inTurnFlicks();
Records randomFlicks();
// Activity decisions with running sequence numbers, `items` a record, of the classes 0 to 7 by chance.
Records activities(size_t items);
// One item of dead reckoning a record.
Records deadReckonings();

}  // namespace bench
