#include "proc/proc.h"

#include <gtest/gtest.h>

#include <ostream>

#include "fake_proc.h"
#include "proc/proc_change.h"
#include "proc/proc_mask.h"
#include "proc/proc_mixer_activity.h"
#include "proc/proc_mixer_pedo.h"

namespace senseloom {
namespace {

using Events = std::vector<std::string>;

bool sameByte(const void* a, const void* b) {
  return *static_cast<const uint8_t*>(a) == *static_cast<const uint8_t*>(b);
}
void keep(void*, int) {}

// What all stages on top of another one have in common.
struct TopStage {
  const char* name;
  bool reduces;  // has a result of its own
  std::unique_ptr<Proc> (*on)(std::unique_ptr<Proc> previous);
};
void PrintTo(const TopStage& stage, std::ostream* out) {
  *out << stage.name;
}

template <class Stage, auto... kArguments>
std::unique_ptr<Proc> on(std::unique_ptr<Proc> previous) {
  return std::make_unique<Stage>(std::move(previous), kArguments...);
}
const TopStage kTopStages[] = {
    {"Mask", false, on<ProcMask, keep, 0>},
    {"Change", false, on<ProcChange>},
    {"MixerActivity", true, on<ProcMixerActivity, 1>},
    {"MixerPedo", true, on<ProcMixerPedo>},
};

class TopOfAChain : public testing::TestWithParam<TopStage> {
 protected:
  // Four elements of four bytes.
  fake::Stage first{.batch = Bytes(16, 1), .bufferLength = 4, .events = {}};
  std::unique_ptr<Proc> stage = GetParam().on(std::make_unique<fake::StageProc>(first, 4, sameByte));
};

TEST_P(TopOfAChain, CopiesElementSizeAndEquality) {
  EXPECT_EQ(stage->elemSize, 4);
  EXPECT_EQ(stage->equalFunc, &sameByte);
  EXPECT_EQ(first.events, Events{});
}

TEST_P(TopOfAChain, RefusesBadOffersWithoutTouchingTheStageBefore) {
  EXPECT_FALSE(stage->accept(nullptr, 1));
  EXPECT_FALSE(stage->accept("data", -1));
  EXPECT_EQ(first.events, Events{});
}

TEST_P(TopOfAChain, OffersWhatItIsOfferedToTheStageBefore) {
  const char data[] = "data";
  first.complete = false;
  EXPECT_FALSE(stage->accept(data, 3));
  EXPECT_FALSE(stage->accept(data, 0));
  EXPECT_EQ(first.offered, data);
  EXPECT_EQ(first.events, (Events{"offered 3", "offered 0"}));
}

TEST_P(TopOfAChain, PassesACompleteBatchOnUnlessItReducesIt) {
  EXPECT_EQ(stage->length(), 0);
  EXPECT_TRUE(stage->accept("data", 2));
  if (GetParam().reduces) {
    EXPECT_NE(stage->buffer(), first.batch.data());
    EXPECT_EQ(stage->length(), 1);
    EXPECT_EQ(stage->bufferLength(), 1);
  } else {
    EXPECT_EQ(stage->buffer(), first.batch.data());
    EXPECT_EQ(stage->length(), 4);
    EXPECT_EQ(stage->bufferLength(), 4);
  }
  EXPECT_EQ(first.events, Events{"offered 2"});
}

TEST_P(TopOfAChain, ResetsTheStageBefore) {
  EXPECT_TRUE(stage->accept("data", 1));
  stage->reset();
  EXPECT_EQ(stage->length(), 0);
  EXPECT_EQ(first.events, (Events{"offered 1", "dropped"}));
}

TEST_P(TopOfAChain, RestartsWithTheStageBefore) {
  EXPECT_TRUE(stage->accept("data", 1));
  stage->restart();
  EXPECT_EQ(stage->length(), 0);
  EXPECT_EQ(first.events, (Events{"offered 1", "dropped"}));
}

TEST_P(TopOfAChain, TakesTheStageBeforeWithIt) {
  stage.reset();
  EXPECT_EQ(first.events, Events{"destroyed"});
}

INSTANTIATE_TEST_SUITE_P(Kinds, TopOfAChain, testing::ValuesIn(kTopStages),
                         [](const auto& tested) { return std::string(tested.param.name); });

TEST(Chain, IsDestroyedWithItsLastStage) {
  fake::Stage first{.batch = Bytes(8), .bufferLength = 2, .events = {}};
  std::unique_ptr<Proc> chain = std::make_unique<fake::StageProc>(first, 4, sameByte);
  for (const TopStage& stage : kTopStages) chain = stage.on(std::move(chain));
  EXPECT_TRUE(chain->accept("data", 1));
  chain.reset();
  EXPECT_EQ(first.events, (Events{"offered 1", "destroyed"}));
}

// Marks a byte, so that the stages that a batch went through can be told.
void increment(void* element, int by) {
  *static_cast<uint8_t*>(element) = static_cast<uint8_t>(*static_cast<uint8_t*>(element) + by);
}

TEST(Chain, BatchGoesThroughItsStagesInTheirOrder) {
  // Element by element: 1, 2 and 3 become 2, 3 and 4, are voted down to class 6, and that becomes 106.
  fake::Stage first{.batch = bytesOf(uint16_t{1}, uint16_t{2}, uint16_t{3}), .bufferLength = 3, .events = {}};
  std::unique_ptr<Proc> chain = std::make_unique<fake::StageProc>(first, 2, sameByte);
  chain = std::make_unique<ProcMask>(std::move(chain), increment, 1);
  chain = std::make_unique<ProcMixerActivity>(std::move(chain), -1);
  chain = std::make_unique<ProcMask>(std::move(chain), increment, 100);
  chain = std::make_unique<ProcChange>(std::move(chain));
  EXPECT_TRUE(chain->accept("data", 1));
  EXPECT_EQ(first.batch, bytesOf(uint16_t{2}, uint16_t{3}, uint16_t{4}));
  EXPECT_EQ(chain->length(), 1);
  EXPECT_EQ(Bytes(chain->buffer(), chain->buffer() + 2), bytesOf(uint16_t{106}));
}

}  // namespace
}  // namespace senseloom
