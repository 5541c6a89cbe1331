#include "proc/proc_mask.h"

#include <gtest/gtest.h>

#include "fake_proc.h"

namespace senseloom {
namespace {

struct Call {
  const void* element;
  int arg;
  bool operator==(const Call&) const = default;
};
std::vector<Call> calls;

// Overwrites the first byte of an element.
void recordAndMark(void* element, int arg) {
  calls.push_back({element, arg});
  *static_cast<uint8_t*>(element) = '*';
}

class Mask : public testing::Test {
 protected:
  void SetUp() override { calls.clear(); }

  fake::Stage behind{.batch = {'a', '1', '.', 'b', '2', '.', 'c', '3', '.', 'd', '4', '.', 'e', '5', '.'},
                     .bufferLength = 4,
                     .events = {}};
  ProcMask stage{std::make_unique<fake::StageProc>(behind, 3), recordAndMark, -77};
};

TEST_F(Mask, RewritesEveryElementOfACompleteBatchInPlaceAndInOrder) {
  EXPECT_TRUE(stage.accept("data", 1));
  const uint8_t* batch = behind.batch.data();
  EXPECT_EQ(calls, (std::vector<Call>{{batch, -77}, {batch + 3, -77}, {batch + 6, -77}, {batch + 9, -77}}));
  EXPECT_EQ(behind.batch, (Bytes{'*', '1', '.', '*', '2', '.', '*', '3', '.', '*', '4', '.', 'e', '5', '.'}));
  EXPECT_EQ(stage.buffer(), batch);
  EXPECT_EQ(stage.length(), 4);
}

TEST_F(Mask, WaitsForTheBatch) {
  behind.complete = false;
  EXPECT_FALSE(stage.accept("data", 1));
  EXPECT_EQ(calls, std::vector<Call>{});
  EXPECT_EQ(behind.batch[0], 'a');
}

TEST_F(Mask, DoesNotResetTheBatchItPassesOn) {
  EXPECT_TRUE(stage.accept("data", 1));
  EXPECT_EQ(behind.events, std::vector<std::string>{"offered 1"});
}

}  // namespace
}  // namespace senseloom
