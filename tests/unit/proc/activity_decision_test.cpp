#include "proc/activity_decision.h"

#include <gtest/gtest.h>

#include "bytes_of.h"

namespace senseloom {
namespace {

TEST(ActivityDecision, HasItsClassIdInTheLowFourBits) {
  struct {
    uint16_t bits;
    uint16_t classId;
  } const cases[] = {{0x0000, 0}, {0x0051, 1}, {0x000F, 15}, {0x7FF0, 0}, {0xFFF3, 3}};
  for (const auto& [bits, classId] : cases) EXPECT_EQ(ActivityDecision::at(bytesOf(bits).data()).classId(), classId);
}

TEST(ActivityDecision, KeepsItsSequenceNumberWithAnotherClassAndNeedsNoAlignment) {
  Bytes bytes = bytesOf(uint8_t{0x77}, uint16_t{0x8005}, uint8_t{0x77});
  ActivityDecision::at(bytes.data() + 1).withClass(10).storeAt(bytes.data() + 1);
  EXPECT_EQ(bytes, bytesOf(uint8_t{0x77}, uint16_t{0x800A}, uint8_t{0x77}));
}

}  // namespace
}  // namespace senseloom
