#include <gtest/gtest.h>
#include <library_memory.h>
#include <random_numbers.h>
#include <recogniser.h>

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "drawings.h"

namespace {

using gesture::Group;
using gesture::recognise;
using gesture::Recogniser;

constexpr const char* kNames[] = {"NumberZero ", "NumberOne ", "NumberTwo ",   "NumberThree ", "NumberFour ",
                                  "NumberFive ", "NumberSix ", "NumberSeven ", "NumberEight ", "NumberNine "};

const char* feed(Recogniser& recogniser, const Record& record) {
  for (std::size_t i = 0; i + 1 < record.size(); ++i) EXPECT_EQ(recogniser.take(record[i].data(), false), nullptr);
  return recogniser.take(record.back().data(), true);
}

Record scaled(const Record& record, double factor) {
  Record result = record;
  for (Group& group : result) {
    for (auto& value : group) value = static_cast<std::int16_t>(std::lround(value * factor));
  }
  return result;
}

TEST(DigitRecogniser, NamesTheDigitAtTheLastGroupOfARecord) {
  Recogniser recogniser;
  for (int digit = 0; digit < 10; ++digit) {
    for (const Record& record : drawingsOf(digit)) EXPECT_STREQ(feed(recogniser, record), kNames[digit]);
  }
}

TEST(DigitRecogniser, KnowsDrawingsAtAnotherRate) {
  for (int digit = 0; digit < 10; ++digit) {
    SCOPED_TRACE(digit);
    Record rare;
    const auto drawings = drawingsOf(digit);
    for (std::size_t i = 0; i < drawings[2].size(); i += 2) rare.push_back(drawings[2][i]);
    EXPECT_EQ(recognise(rare), digit);
  }
}

TEST(DigitRecogniser, KnowsDrawingsInAnotherSize) {
  for (int digit = 0; digit < 10; ++digit) {
    SCOPED_TRACE(digit);
    EXPECT_EQ(recognise(scaled(drawingsOf(digit)[2], 0.8)), digit);
    EXPECT_EQ(recognise(scaled(drawingsOf(digit)[2], 1.2)), digit);
  }
}

TEST(DigitRecogniser, KnowsTheSymmetricDigitsDrawnTheOtherWayRound) {
  for (const int digit : {0, 8}) {
    Record record = drawingsOf(digit)[2];
    for (Group& group : record) {
      for (const std::size_t axis : {0U, 4U, 5U}) group[axis] = static_cast<std::int16_t>(-group[axis]);
    }
    EXPECT_EQ(recognise(record), digit);
  }
}

TEST(DigitRecogniser, KnowsNoDrawingThatIsMuchTooSmallOrTooLarge) {
  for (int digit = 0; digit < 10; ++digit) {
    EXPECT_EQ(recognise(scaled(drawingsOf(digit)[2], 0.1)), std::nullopt);
    EXPECT_EQ(recognise(scaled(drawingsOf(digit)[2], 8)), std::nullopt);
  }
}

TEST(DigitRecogniser, KnowsNoPartOfADrawingAsAnotherDigitsWhole) {
  for (int digit = 2; digit < 10; ++digit) {
    Record part = drawingsOf(digit)[2];
    part.resize(part.size() / 4);
    const auto found = recognise(part);
    EXPECT_TRUE(!found || *found == digit) << digit << " as " << *found;
  }
}

TEST(DigitRecogniser, KnowsNoShaking) {
  for (const double period : {6.0, 10.0, 15.0, 25.0}) {
    Record record;
    for (int i = 0; i < 130; ++i) {
      const double phase = 2 * 3.14159 * i / period;
      record.push_back(
          {static_cast<std::int16_t>(400 * std::sin(phase)), 1000, static_cast<std::int16_t>(100 * std::cos(phase)), 0,
           static_cast<std::int16_t>(300 * std::sin(phase)), static_cast<std::int16_t>(900 * std::cos(phase))});
    }
    EXPECT_EQ(recognise(record), std::nullopt) << period;
  }
}

TEST(DigitRecogniser, KnowsNothingInRecordsThatAreTooShortOrTooLong) {
  Recogniser recogniser;
  const Record record = drawingsOf(3)[0];
  EXPECT_EQ(feed(recogniser, Record(record.begin(), record.begin() + 15)), nullptr);
  Record tooLong = record;
  tooLong.resize(171, record.back());
  EXPECT_EQ(feed(recogniser, tooLong), nullptr);
  tooLong.resize(100'000, record.back());
  EXPECT_EQ(feed(recogniser, tooLong), nullptr);
  EXPECT_STREQ(feed(recogniser, record), "NumberThree ");
}

TEST(DigitRecogniser, KnowsNothingInRandomBytes) {
  RandomNumbers random;
  Recogniser recogniser;
  for (int i = 0; i < 300; ++i) {
    Record record(1 + random.below(200));
    for (Group& group : record) {
      for (auto& value : group) value = static_cast<std::int16_t>(random.next());
    }
    EXPECT_EQ(feed(recogniser, record), nullptr);
  }
}

TEST(DigitRecogniser, AllocatesNothing) {
  const Record record = drawingsOf(5)[0];
  Recogniser recogniser;
  const memory::AllocationCount allocations;
  const char* const name = feed(recogniser, record);
  const std::size_t made = allocations.made();
  EXPECT_STREQ(name, "NumberFive ");
  EXPECT_EQ(made, 0U);
}

}  // namespace
