#include "records.h"

#include <random>

namespace bench {
namespace {

void setValue(Records& records, size_t index, uint16_t value) {
  const uint64_t timestamp = index + 1;
  std::memcpy(records.at(index), &timestamp, sizeof timestamp);
  std::memcpy(records.at(index) + kValueOffset, &value, sizeof value);
}

}  // namespace

Records inTurnFlicks() {
  Records records(kRecords, kHeaderSize);
  for (size_t i = 0; i < kRecords; ++i) setValue(records, i, static_cast<uint16_t>(1 + i % kFlickClasses));
  return records;
}

Records randomFlicks() {
  Records records(kRecords, kHeaderSize);
  std::mt19937 random(1);
  for (size_t i = 0; i < kRecords; ++i) setValue(records, i, static_cast<uint16_t>(1 + random() % kFlickClasses));
  return records;
}

Records activities(size_t items) {
  Records records(kRecords, kHeaderSize + items * sizeof(uint16_t));
  std::mt19937 random(2);
  size_t sequence = 0;
  for (size_t i = 0; i < kRecords; ++i) {
    setValue(records, i, static_cast<uint16_t>(items));
    for (size_t item = 0; item < items; ++item) {
      const auto decision = static_cast<uint16_t>(sequence++ << 4 | random() % 8);
      std::memcpy(records.at(i) + kHeaderSize + item * sizeof decision, &decision, sizeof decision);
    }
  }
  return records;
}

Records deadReckonings() {
  Records records(kRecords, kHeaderSize + kDeadReckoningItem);
  for (size_t i = 0; i < kRecords; ++i) {
    setValue(records, i, 1);
    std::memset(records.at(i) + kHeaderSize, static_cast<int>(i % 256), kDeadReckoningItem);
  }
  return records;
}

}  // namespace bench
