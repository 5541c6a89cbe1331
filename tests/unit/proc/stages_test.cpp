#include <gtest/gtest.h>

#include <array>
#include <limits>
#include <string>
#include <vector>

#include "bytes.h"
#include "proc/proc_change.h"
#include "proc/proc_mask.h"
#include "proc/proc_mixer.h"
#include "proc/proc_mixer_activity.h"
#include "proc/proc_mixer_pedo.h"
#include "proc/proc_nm.h"

namespace senseloom {
namespace {

using Events = std::vector<std::string>;

// A stage before the one that is tested, with elements of one letter: it answers offers as it is told, and tells what
// becomes of it.
struct Before {
  std::string batch;
  int length = 0;
  int bufferLength = 0;
  bool completes = true;
  Events events;
};
struct FakeStage {
  static constexpr size_t kElementSize = 1;

  bool accept(const void* data, int count) {
    before->events.push_back(std::string(static_cast<const char*>(data)) + " of " + std::to_string(count));
    return before->completes;
  }
  uint8_t* buffer() const { return reinterpret_cast<uint8_t*>(before->batch.data()); }
  int length() const { return before->length; }
  int bufferLength() const { return before->bufferLength; }
  void reset() { before->events.push_back("reset"); }

  Before* before = nullptr;
};
Before complete(const std::string& batch) {
  const auto size = static_cast<int>(batch.size());
  return {.batch = batch, .length = size, .bufferLength = size, .events = {}};
}

// --- gathering

// Elements of two letters.
std::string gathered(const ProcNM<2>& stage) {
  return {reinterpret_cast<const char*>(stage.buffer()), 2 * static_cast<size_t>(stage.length())};
}

struct Offer {
  const char* elements;
  int count;
  bool completes;
  const char* batch;
};
void expectAnswers(ProcNM<2>& stage, std::initializer_list<Offer> offers) {
  for (const Offer& offer : offers) {
    EXPECT_EQ(stage.accept(offer.elements, offer.count), offer.completes) << offer.batch;
    EXPECT_EQ(gathered(stage), offer.batch);
  }
}

TEST(ProcNM, CompletesWithTheOfferThatFillsTheBatchAndRefusesMoreUntilItIsReset) {
  std::vector<uint8_t> memory(8);
  ProcNM<2> stage(memory);
  EXPECT_EQ(stage.bufferLength(), 4);
  expectAnswers(stage, {{"a1", 1, false, "a1"},
                        {"b2c3", 2, false, "a1b2c3"},
                        {"d4", 1, true, "a1b2c3d4"},
                        {"e5", 1, false, "a1b2c3d4"},
                        {"e5", 0, false, "a1b2c3d4"}});
  stage.reset();
  expectAnswers(stage, {{"f6", 1, false, "f6"}});
}

TEST(ProcNM, DropsElementsBeyondItsRoom) {
  std::vector<uint8_t> memory(4);
  ProcNM<2> stage(memory);
  expectAnswers(stage, {{"a1", 1, false, "a1"}, {"b2c3d4", 3, true, "a1b2"}});
  stage.reset();
  expectAnswers(stage, {{"e5f6", std::numeric_limits<int>::max(), true, "e5f6"}});
}

TEST(ProcNM, RefusesEmptyAndBadOffers) {
  std::vector<uint8_t> memory(4);
  ProcNM<2> stage(memory);
  expectAnswers(stage, {{"a1", 1, false, "a1"},
                        {"b2", 0, false, "a1"},
                        {"b2", -1, false, "a1"},
                        {"b2", std::numeric_limits<int>::min(), false, "a1"},
                        {nullptr, 1, false, "a1"},
                        {"b2", 1, true, "a1b2"}});
}

TEST(ProcNM, WithoutMemoryRefusesEveryOffer) {
  ProcNM<2> stage;
  expectAnswers(stage, {{"a1", 1, false, ""}, {"a1", 0, false, ""}});
  stage.reset();
  expectAnswers(stage, {{"a1", 1, false, ""}});
}

// --- masking

void maskLetter(void* element, int arg) {
  auto& letter = *static_cast<char*>(element);
  letter = static_cast<char>(letter + arg);
}
using Mask = ProcMask<FakeStage, maskLetter>;

TEST(MaskStage, RewritesEveryElementOfACompleteBatchInPlaceAndDoesNotResetIt) {
  Before before = complete("abcd");
  before.length = 3;
  Mask stage(1, FakeStage{&before});
  EXPECT_TRUE(stage.accept("data", 7));
  EXPECT_EQ(before.batch, "bcdd") << "the elements that there are, and no more";
  EXPECT_EQ(before.events, Events{"data of 7"});
  EXPECT_EQ(stage.buffer(), FakeStage{&before}.buffer());
  EXPECT_EQ(stage.length(), 3);
  EXPECT_EQ(stage.bufferLength(), 4);
  stage.reset();
  EXPECT_EQ(before.events.back(), "reset");
}

TEST(MaskStage, WaitsForTheBatch) {
  Before before = complete("abcd");
  before.completes = false;
  Mask stage(1, FakeStage{&before});
  EXPECT_FALSE(stage.accept("data", 1));
  EXPECT_EQ(before.batch, "abcd");
}

// --- change

Events comparisons;
bool sameLetter(const void* a, const void* b) {
  const char letters[] = {*static_cast<const char*>(a), '=', *static_cast<const char*>(b), '\0'};
  comparisons.emplace_back(letters);
  return (letters[0] | 0x20) == (letters[2] | 0x20);  // upper and lower case are the same
}

// A change stage over batches of the given number of elements.
class ChangeStage : public testing::Test {
 protected:
  bool passes(const std::string& batch) {
    before = complete(batch);
    comparisons.clear();
    return stage.accept("data", 1);
  }

  Before before;
  ProcChange<FakeStage, sameLetter> stage{FakeStage{&before}};
};

TEST_F(ChangeStage, FirstBatchPassesWithoutComparisonAndStays) {
  EXPECT_TRUE(passes("aaa"));
  EXPECT_EQ(comparisons, Events{});
  EXPECT_EQ(before.events, Events{"data of 1"});
  EXPECT_EQ(stage.length(), 3);
  EXPECT_EQ(stage.bufferLength(), 3);
}

TEST_F(ChangeStage, UnchangedBatchIsDropped) {
  EXPECT_TRUE(passes("aa"));
  EXPECT_FALSE(passes("aA"));
  EXPECT_EQ(before.events, (Events{"data of 1", "reset"}));
  EXPECT_TRUE(passes("ab"));
}

TEST_F(ChangeStage, ComparesElementsWithTheRememberedOneUpToTheFirstDifference) {
  EXPECT_TRUE(passes("cbaA"));
  EXPECT_TRUE(passes("aabb"));
  EXPECT_EQ(comparisons, (Events{"a=A", "a=A", "b=A"}));
  EXPECT_FALSE(passes("bbBb"));
  EXPECT_EQ(comparisons, (Events{"b=b", "b=b", "B=b", "b=b"}));
}

TEST_F(ChangeStage, RemembersTheLastElementAndNotTheOneThatDiffered) {
  EXPECT_TRUE(passes("aaa"));
  EXPECT_TRUE(passes("aba"));
  EXPECT_FALSE(passes("aaa"));
}

TEST_F(ChangeStage, RemembersWhatPassedAcrossAReset) {
  EXPECT_TRUE(passes("a"));
  stage.reset();
  EXPECT_FALSE(passes("A"));
}

TEST_F(ChangeStage, WaitsForTheBatch) {
  before.completes = false;
  EXPECT_FALSE(stage.accept("data", 1));
  EXPECT_EQ(before.events, Events{"data of 1"});
}

// --- mixing

// Writes the number of elements that a complete batch of the previous stage has.
struct CountMix {
  void operator()(const FakeStage& previous, uint8_t* result) const {
    *result = static_cast<uint8_t>('0' + previous.bufferLength());
    ++*mixes;
  }
  int* mixes = nullptr;
};

TEST(MixingStage, MixesACompleteBatchIntoOneElementAndRefusesMoreUntilItIsReset) {
  Before before = complete("abcd");
  before.length = 2;
  int mixes = 0;
  ProcMixer<FakeStage, CountMix> stage(CountMix{&mixes}, FakeStage{&before});
  EXPECT_EQ(stage.length(), 0);
  EXPECT_TRUE(stage.accept("data", 9));
  EXPECT_EQ(*stage.buffer(), '4') << "a previous stage that completes with fewer elements counts with all its room";
  EXPECT_EQ(stage.length(), 1);
  EXPECT_EQ(stage.bufferLength(), 1);
  EXPECT_FALSE(stage.accept("more", 1));
  EXPECT_EQ(mixes, 1);
  stage.reset();
  EXPECT_EQ(before.events.back(), "reset");
  EXPECT_EQ(stage.length(), 0);
  EXPECT_TRUE(stage.accept("more", 1));
}

TEST(MixingStage, WithoutACompleteBatchHasNoResult) {
  int mixes = 0;
  Before before = complete("");
  before.completes = false;
  ProcMixer<FakeStage, CountMix> stage(CountMix{&mixes}, FakeStage{&before});
  EXPECT_FALSE(stage.accept("data", 1));
  EXPECT_EQ(stage.length(), 0) << "of a stage before that has no room, too";
  EXPECT_EQ(mixes, 0);
}

TEST(PedoMixer, KeepsTheMostRecentCountOfABatch) {
  std::vector<uint8_t> memory(12);
  ProcMixerPedo<ProcNM<4>> stage{LatestCount{}, std::span<uint8_t>(memory)};
  const int32_t counts[] = {7, -8, 0x01020304};
  EXPECT_FALSE(stage.accept(counts, 2));
  EXPECT_TRUE(stage.accept(counts + 2, 1));
  EXPECT_EQ(loadI32({stage.buffer(), 4}, 0), 0x01020304);
}

// A stage that completes with fewer elements than it has room for.
template <class Element, int kLength>
struct ShortStage {
  static constexpr size_t kElementSize = sizeof(Element);

  static bool accept(const void*, int) { return true; }
  const uint8_t* buffer() const { return reinterpret_cast<const uint8_t*>(elements.data()); }
  static int length() { return kLength; }
  static int bufferLength() { return 3; }

  std::array<Element, 3> elements;
};

TEST(PedoMixer, KeepsTheLastCountThatThereIs) {
  using Stage = ShortStage<int32_t, 2>;
  ProcMixerPedo<Stage> stage(LatestCount{}, Stage{{7, 8, 9}});
  EXPECT_TRUE(stage.accept("data", 1));
  EXPECT_EQ(loadI32({stage.buffer(), 4}, 0), 8);
}

TEST(ActivityMixer, CountsAllTheRoomOfTheStageBefore) {
  using Stage = ShortStage<uint16_t, 2>;
  ProcMixerActivity<Stage> stage(ActivityVote(-1), Stage{{0x51, 0x62, 0x72}});
  EXPECT_TRUE(stage.accept("data", 1));
  EXPECT_EQ(loadU16({stage.buffer(), 2}, 0), 0x52)
      << "two of three; of the first two alone no class has more than half";
}

TEST(ActivityMixer, OverAStageWithoutRoomHasNoResult) {
  ProcMixerActivity<ProcNM<2>> stage(ActivityVote(-1));
  const uint16_t decision = 0x51;
  EXPECT_FALSE(stage.accept(&decision, 1));
  EXPECT_EQ(stage.length(), 0);
}

}  // namespace
}  // namespace senseloom
