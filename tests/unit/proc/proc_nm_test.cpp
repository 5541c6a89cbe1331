#include "proc/proc_nm.h"

#include <gtest/gtest.h>

#include <limits>
#include <string>

namespace senseloom {
namespace {

// Elements of two letters.
constexpr int kElementSize = 2;

bool neverEqual(const void*, const void*) {
  ADD_FAILURE() << "gathering compares no elements";
  return false;
}
int noSequence(const void*) {
  ADD_FAILURE() << "gathering asks for no sequence numbers";
  return 0;
}

std::string gathered(ProcNM& stage) {
  return {reinterpret_cast<const char*>(stage.buffer()), static_cast<size_t>(stage.length() * stage.elemSize)};
}

// Offers elements and expects the answer and then the batch.
struct Offer {
  const char* elements;
  int count;
  bool completes;
  const char* batch;
};
void expectAnswers(ProcNM& stage, std::initializer_list<Offer> offers) {
  for (const Offer& offer : offers) {
    SCOPED_TRACE(std::string(offer.elements != nullptr ? offer.elements : "null") + " as " +
                 std::to_string(offer.count));
    EXPECT_EQ(stage.accept(offer.elements, offer.count), offer.completes);
    EXPECT_EQ(gathered(stage), offer.batch);
  }
}

TEST(ProcNM, CarriesWhatItIsMadeWith) {
  const ProcNM stage(kElementSize, neverEqual, noSequence, 4);
  EXPECT_EQ(stage.elemSize, kElementSize);
  EXPECT_EQ(stage.equalFunc, &neverEqual);
  EXPECT_EQ(stage.checkSeqFunc, &noSequence);
  EXPECT_EQ(stage.bufferLength(), 4);
  EXPECT_EQ(stage.length(), 0);
}

TEST(ProcNM, CanGoWithoutSequenceNumbers) {
  const ProcNM stage(kElementSize, neverEqual, 4);
  EXPECT_EQ(stage.equalFunc, &neverEqual);
  EXPECT_EQ(stage.checkSeqFunc, nullptr);
  EXPECT_EQ(stage.bufferLength(), 4);
}

TEST(ProcNM, CompletesWithTheOfferThatFillsTheBatchAndRefusesMore) {
  ProcNM stage(kElementSize, neverEqual, noSequence, 4);
  expectAnswers(stage, {{"a1", 1, false, "a1"},
                        {"b2", 1, false, "a1b2"},
                        {"c3", 1, false, "a1b2c3"},
                        {"d4", 1, true, "a1b2c3d4"},
                        {"e5", 1, false, "a1b2c3d4"},
                        {"e5", 0, false, "a1b2c3d4"}});
  EXPECT_EQ(stage.bufferLength(), 4);
}

TEST(ProcNM, GathersOffersOfSeveralElements) {
  ProcNM stage(kElementSize, neverEqual, noSequence, 5);
  expectAnswers(stage, {{"a1b2", 2, false, "a1b2"}, {"c3d4e5", 3, true, "a1b2c3d4e5"}});
}

TEST(ProcNM, DropsElementsBeyondItsRoom) {
  ProcNM stage(kElementSize, neverEqual, noSequence, 2);
  expectAnswers(stage, {{"a1b2c3", 3, true, "a1b2"}});
  stage.reset();
  expectAnswers(stage, {{"d4", 1, false, "d4"}, {"e5f6g7", 3, true, "d4e5"}});
  stage.reset();
  expectAnswers(stage, {{"h8i9", std::numeric_limits<int>::max(), true, "h8i9"}});
}

TEST(ProcNM, RefusesEmptyAndBadOffers) {
  ProcNM stage(kElementSize, neverEqual, noSequence, 2);
  expectAnswers(stage, {{"a1", 1, false, "a1"},
                        {"b2", 0, false, "a1"},
                        {"b2", -1, false, "a1"},
                        {"b2", std::numeric_limits<int>::min(), false, "a1"},
                        {nullptr, 1, false, "a1"},
                        {"b2", 1, true, "a1b2"}});
}

TEST(ProcNM, ResetStartsOverAtTheFrontAndKeepsTheBytes) {
  ProcNM stage(kElementSize, neverEqual, noSequence, 2);
  expectAnswers(stage, {{"a1b2", 2, true, "a1b2"}});
  stage.reset();
  EXPECT_EQ(stage.length(), 0);
  EXPECT_EQ(std::string(reinterpret_cast<const char*>(stage.buffer()), 4), "a1b2");
  expectAnswers(stage, {{"c3", 1, false, "c3"}});
  EXPECT_EQ(std::string(reinterpret_cast<const char*>(stage.buffer()), 4), "c3b2");
  stage.reset();
  expectAnswers(stage, {{"d4", 1, false, "d4"}, {"e5", 1, true, "d4e5"}});
}

TEST(ProcNM, BatchOfOneCompletesOnEveryOffer) {
  ProcNM stage(kElementSize, neverEqual, noSequence, 1);
  for (const char* element : {"a1", "b2", "c3"}) {
    expectAnswers(stage, {{element, 1, true, element}});
    stage.reset();
  }
}

TEST(ProcNM, BatchOfNothingRefusesEveryOffer) {
  for (const int capacity : {0, -1, std::numeric_limits<int>::min()}) {
    SCOPED_TRACE(capacity);
    ProcNM stage(kElementSize, neverEqual, noSequence, capacity);
    expectAnswers(stage, {{"a1", 1, false, ""}, {"a1", 0, false, ""}});
    stage.reset();
    expectAnswers(stage, {{"a1", 1, false, ""}});
  }
}

TEST(ProcNM, TakesElementsOfAnySize) {
  const std::string elements = "abcdefghijklmnopqrstuvwxyz";
  for (const int size : {1, 3, 7, 13}) {
    ProcNM stage(size, neverEqual, noSequence, 2);
    EXPECT_FALSE(stage.accept(elements.data(), 1));
    EXPECT_TRUE(stage.accept(elements.data() + size, 1));
    EXPECT_EQ(gathered(stage), elements.substr(0, static_cast<size_t>(2 * size)));
  }
}

}  // namespace
}  // namespace senseloom
