#include "proc/proc_change.h"

#include <gtest/gtest.h>

#include <algorithm>

#include "fake_proc.h"
#include "proc/proc_mask.h"
#include "proc/proc_nm.h"

namespace senseloom {
namespace {

using Events = std::vector<std::string>;

// Elements of two letters: a class, and a sequence number that equality ignores.
constexpr int kElementSize = 2;
Events comparisons;

std::string element(const void* at) {
  return {static_cast<const char*>(at), kElementSize};
}
bool sameClass(const void* a, const void* b) {
  comparisons.push_back(element(a) + "=" + element(b));
  return element(a)[0] == element(b)[0];
}

// A change stage over batches of the given number of elements.
class Change {
 public:
  explicit Change(int elements)
      : first{.batch = Bytes(static_cast<size_t>(elements * kElementSize)), .bufferLength = elements, .events = {}} {}

  // Whether a batch gets through.
  bool passes(const std::string& batch) {
    EXPECT_EQ(batch.size(), first.batch.size());
    std::copy(batch.begin(), batch.end(), first.batch.begin());
    first.length = 0;
    first.events.clear();
    comparisons.clear();
    return stage.accept("data", 1);
  }

  fake::Stage first;
  ProcChange stage{std::make_unique<fake::StageProc>(first, kElementSize, sameClass)};
};

TEST(ChangeStage, FirstBatchPassesWithoutComparison) {
  Change change(3);
  EXPECT_TRUE(change.passes("A1A2A3"));
  EXPECT_EQ(comparisons, Events{});
  EXPECT_EQ(change.first.events, Events{"offered 1"});
}

TEST(ChangeStage, UnchangedBatchIsThrownAway) {
  Change change(2);
  EXPECT_TRUE(change.passes("A1A1"));
  EXPECT_FALSE(change.passes("A1A1"));
  EXPECT_EQ(change.first.events, (Events{"offered 1", "dropped"}));
  EXPECT_EQ(change.stage.length(), 0);
}

TEST(ChangeStage, ChangedBatchStaysUntilItIsReset) {
  Change change(1);
  EXPECT_TRUE(change.passes("A1"));
  EXPECT_TRUE(change.passes("B1"));
  EXPECT_EQ(change.first.events, Events{"offered 1"});
  EXPECT_EQ(change.stage.length(), 1);
}

TEST(ChangeStage, WhatEqualityIgnoresIsNoChange) {
  Change change(2);
  EXPECT_TRUE(change.passes("A1A2"));
  EXPECT_FALSE(change.passes("A8A9"));
}

TEST(ChangeStage, ComparesElementsWithTheRememberedOneUpToTheFirstDifference) {
  Change change(4);
  EXPECT_TRUE(change.passes("C1B1A1A2"));
  EXPECT_TRUE(change.passes("A3A4B5B6"));
  EXPECT_EQ(comparisons, (Events{"A3=A2", "A4=A2", "B5=A2"}));
  EXPECT_FALSE(change.passes("B7B8B9B0"));
  EXPECT_EQ(comparisons, (Events{"B7=B6", "B8=B6", "B9=B6", "B0=B6"}));
}

TEST(ChangeStage, AnyElementThatDiffersIsAChangeAndTheLastIsRemembered) {
  Change change(3);
  EXPECT_TRUE(change.passes("A1A1A1"));
  EXPECT_TRUE(change.passes("B2A3A3"));
  EXPECT_FALSE(change.passes("A4A5A5")) << "A is remembered, though B differed";
  EXPECT_TRUE(change.passes("A6B7A8"));
  EXPECT_FALSE(change.passes("A9A0A1"));
  EXPECT_TRUE(change.passes("A2A3B4"));
  EXPECT_FALSE(change.passes("B5B6B7"));
  EXPECT_TRUE(change.passes("A8A9A0"));
}

TEST(ChangeStage, SuppressedBatchIsNotRemembered) {
  Change change(1);
  EXPECT_TRUE(change.passes("A1"));
  EXPECT_FALSE(change.passes("A2"));
  EXPECT_FALSE(change.passes("A3"));
  EXPECT_EQ(comparisons, Events{"A3=A1"});
}

TEST(ChangeStage, WhatIsRememberedSurvivesReset) {
  Change change(1);
  EXPECT_TRUE(change.passes("A1"));
  change.stage.reset();
  EXPECT_FALSE(change.passes("A2"));
  EXPECT_TRUE(change.passes("B3"));
  change.stage.reset();
  EXPECT_FALSE(change.passes("B4"));
}

TEST(ChangeStage, RestartForgetsWhatIsRemembered) {
  Change change(1);
  EXPECT_TRUE(change.passes("A1"));
  change.stage.restart();
  EXPECT_EQ(change.first.events.back(), "dropped");
  EXPECT_TRUE(change.passes("A2"));
  EXPECT_EQ(comparisons, Events{});
  EXPECT_FALSE(change.passes("A3"));
}

TEST(ChangeStage, RestartReachesItBehindAnotherStage) {
  fake::Stage first{.batch = {'A', '1'}, .bufferLength = 1, .events = {}};
  ProcMask top(
      std::make_unique<ProcChange>(std::make_unique<fake::StageProc>(first, kElementSize, sameClass)),
      [](void*, int) {}, 0);
  EXPECT_TRUE(top.accept("data", 1));
  top.reset();
  EXPECT_FALSE(top.accept("data", 1));
  top.restart();
  EXPECT_TRUE(top.accept("data", 1));
}

TEST(ChangeStage, WaitsForTheBatch) {
  Change change(1);
  EXPECT_TRUE(change.passes("A1"));
  change.first.complete = false;
  EXPECT_FALSE(change.passes("B2"));
  EXPECT_EQ(comparisons, Events{});
  EXPECT_EQ(change.first.events, Events{"offered 1"});
}

TEST(ChangeStage, SuppressedBatchLeavesTheStageBeforeEmpty) {
  auto gathering = std::make_unique<ProcNM>(kElementSize, sameClass, 2);
  ProcNM* const first = gathering.get();
  ProcChange stage(std::move(gathering));
  EXPECT_FALSE(stage.accept("A1", 1));
  EXPECT_TRUE(stage.accept("A2", 1));
  EXPECT_EQ(first->length(), 2);
  EXPECT_FALSE(stage.accept("A9", 1)) << "the batch was not reset";
  stage.reset();
  EXPECT_FALSE(stage.accept("A3A4", 2));
  EXPECT_EQ(first->length(), 0);
  EXPECT_FALSE(stage.accept("B5", 1));
  EXPECT_EQ(first->length(), 1);
  EXPECT_TRUE(stage.accept("A6", 1));
  EXPECT_EQ(std::string(reinterpret_cast<const char*>(stage.buffer()), 4), "B5A6");
}

}  // namespace
}  // namespace senseloom
