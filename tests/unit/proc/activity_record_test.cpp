#include "proc/activity_record.h"

#include <gtest/gtest.h>

#include "bytes_of.h"

namespace senseloom {
namespace {

TEST(ActivityRecord, HasClassIdBelowSignedSequenceNumber) {
  struct {
    uint16_t bits;
    uint16_t classId;
    int sequence;
  } const cases[] = {
      {0x0000, 0, 0}, {0x0051, 1, 5}, {0x000F, 15, 0}, {0x7FF0, 0, 2047}, {0x8000, 0, -2048}, {0xFFF3, 3, -1},
  };
  for (const auto& [bits, classId, sequence] : cases) {
    const auto record = ActivityRecord::at(bytesOf(bits).data());
    EXPECT_EQ(record.classId(), classId) << bits;
    EXPECT_EQ(record.sequence(), sequence) << bits;
  }
}

TEST(ActivityRecord, OtherClassKeepsTheSequenceNumber) {
  Bytes bytes = bytesOf(uint16_t{0x8005}, uint16_t{0xFFFF});
  ActivityRecord::at(bytes.data()).withClass(10).storeAt(bytes.data());
  EXPECT_EQ(bytes, bytesOf(uint16_t{0x800A}, uint16_t{0xFFFF}));
}

TEST(ActivityRecord, NeedsNoAlignment) {
  Bytes bytes = bytesOf(uint8_t{0x77}, uint16_t{0x0123}, uint8_t{0x77});
  ActivityRecord::at(bytes.data() + 1).withClass(4).storeAt(bytes.data() + 1);
  EXPECT_EQ(bytes, bytesOf(uint8_t{0x77}, uint16_t{0x0124}, uint8_t{0x77}));
}

}  // namespace
}  // namespace senseloom
