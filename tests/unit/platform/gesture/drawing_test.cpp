#include <drawing.h>
#include <gtest/gtest.h>
#include <templates.h>

#include <cstddef>
#include <cstdint>
#include <limits>

#include "drawings.h"

namespace {

using gesture::describe;
using gesture::Drawing;
using gesture::Group;
using gesture::Points;

constexpr Group kStill = {0, 1000, 0, 0, 0, 0};

Record between(std::size_t stillBefore, const Record& movement, std::size_t stillAfter) {
  Record record(stillBefore, kStill);
  record.insert(record.end(), movement.begin(), movement.end());
  record.insert(record.end(), stillAfter, kStill);
  return record;
}

Record times(int factor, Record record) {
  for (Group& group : record) {
    for (auto& value : group) value = static_cast<std::int16_t>(value * factor);
  }
  return record;
}

// One axis of three is 50 or -50 throughout: the root mean square is 50 / sqrt(3), which becomes 10, and 50 becomes
// 10 * sqrt(3), rounded.
Points leftAndRightPoints() {
  Points points;
  for (std::size_t p = 0; p < points.size(); ++p) {
    points[p] = p < 12 ? gesture::Point{17, 0, 0, 0, 0, 17} : gesture::Point{-17, 0, 0, 0, 0, -17};
  }
  return points;
}

TEST(DrawingOfARecord, HasTheMeansOfItsPartsScaledToOneSize) {
  const auto drawing = describe(leftAndRight(12));
  ASSERT_TRUE(drawing);
  EXPECT_EQ(drawing->points, leftAndRightPoints());
  EXPECT_EQ(drawing->accelerationSize, 28U);  // 50 / sqrt(3)
  EXPECT_EQ(drawing->rateSize, 57U);          // 100 / sqrt(3)
}

TEST(DrawingOfARecord, IsTheSameDrawnFastOrSlowly) {
  for (const int groupsEach : {8, 13, 18, 24, 85}) {
    SCOPED_TRACE(groupsEach);
    const auto drawing = describe(leftAndRight(groupsEach));
    ASSERT_TRUE(drawing);
    EXPECT_EQ(drawing->points, leftAndRightPoints());
  }
}

TEST(DrawingOfARecord, IsTheSameDrawnSmallOrLarge) {
  const auto drawing = describe(times(3, leftAndRight(12)));
  ASSERT_TRUE(drawing);
  EXPECT_EQ(drawing->points, leftAndRightPoints());
  EXPECT_EQ(drawing->accelerationSize, 86U);
  EXPECT_EQ(drawing->rateSize, 173U);
}

TEST(DrawingOfARecord, IsTheSameHeldAtAnyTilt) {
  Record tilted = leftAndRight(12);
  for (Group& group : tilted) group[1] = 1000;
  for (Group& group : tilted) group[2] = -300;
  const auto drawing = describe(tilted);
  ASSERT_TRUE(drawing);
  EXPECT_EQ(drawing->points, leftAndRightPoints());
}

TEST(DrawingOfARecord, LeavesOutTheStillEnds) {
  const auto some = describe(between(10, leftAndRight(30), 20));
  const auto more = describe(between(70, leftAndRight(30), 40));
  ASSERT_TRUE(some);
  ASSERT_TRUE(more);
  EXPECT_EQ(some->points, more->points);
  EXPECT_EQ(some->rateSize, more->rateSize);
}

TEST(DrawingOfARecord, ClipsWhatIsFarOffTheRest) {
  Record record = leftAndRight(48);
  for (std::size_t i = 0; i < 4; ++i) record[i][5] = 5000;
  const auto drawing = describe(record);
  ASSERT_TRUE(drawing);
  EXPECT_EQ(drawing->points[0][5], 27);
}

TEST(DrawingOfARecord, TakesTheLargestValues) {
  constexpr auto kLeast = std::numeric_limits<std::int16_t>::min();
  constexpr auto kMost = std::numeric_limits<std::int16_t>::max();
  Record record(85, {kMost, kMost, kMost, kMost, kMost, kMost});
  record.insert(record.end(), 85, {kLeast, kLeast, kLeast, kLeast, kLeast, kLeast});
  const auto drawing = describe(record);
  ASSERT_TRUE(drawing);
  // The mean is -0.5, so that all are 32767.5 off it; they stay 10.
  EXPECT_EQ(drawing->points[0], (gesture::Point{10, 10, 10, 10, 10, 10}));
  EXPECT_EQ(drawing->points[23], (gesture::Point{-10, -10, -10, -10, -10, -10}));
  EXPECT_EQ(drawing->accelerationSize, 32767U);
}

TEST(DrawingOfARecord, NeedsSixteenToAHundredAndSeventyGroups) {
  EXPECT_FALSE(describe({}));
  Record record = leftAndRight(8);
  EXPECT_TRUE(describe(record));
  record.pop_back();
  EXPECT_FALSE(describe(record));
  record = leftAndRight(85);
  EXPECT_TRUE(describe(record));
  record.push_back(record.back());
  EXPECT_FALSE(describe(record));
}

// Smoothed over five groups, a movement takes two more groups on either side.
TEST(DrawingOfARecord, NeedsTwelveGroupsThatMove) {
  EXPECT_TRUE(describe(between(40, leftAndRight(4), 40)));
  EXPECT_FALSE(describe(between(40, leftAndRight(3), 40)));
}

TEST(DrawingOfARecord, NeedsAccelerationAndTurningThatChange) {
  EXPECT_FALSE(describe(Record(100, kStill)));
  EXPECT_FALSE(describe(Record(100, {0, 1000, 0, 0, 500, 0})));
  Record turning = leftAndRight(50);
  for (Group& group : turning) group[0] = 0;
  EXPECT_FALSE(describe(turning));
  Record pushed = leftAndRight(50);
  for (Group& group : pushed) group[5] = 100;
  EXPECT_FALSE(describe(pushed));
}

TEST(DrawingInAMirror, SwapsLeftAndRightAndTheSenseOfTurningAboutTheOtherAxes) {
  Points points{};
  points[3] = {1, 2, 3, 4, 5, 6};
  Points expected{};
  expected[3] = {-1, 2, 3, 4, -5, -6};
  EXPECT_EQ(gesture::mirrored(points), expected);
}

// So the program that learned the templates describes drawings as the engine does.
TEST(Templates, AreTheDrawingsOfTheDataDescribed) {
  const auto templates = gesture::templates();
  std::size_t next = 0;
  for (int digit = 0; digit < 10; ++digit) {
    for (const Record& record : drawingsOf(digit)) {
      SCOPED_TRACE(next);
      ASSERT_LT(next, templates.size());
      const auto& learned = templates[next++];
      const auto drawing = describe(record);
      ASSERT_TRUE(drawing);
      EXPECT_EQ(learned.digit, digit);
      EXPECT_EQ(pointsOf(learned), drawing->points);
    }
  }
  EXPECT_EQ(next, templates.size());
}

}  // namespace
