#include "plot/timeline.h"

#include <gtest/gtest.h>

#include <memory>

namespace senseloom::tool {
namespace {

TEST(Timeline, HasABinARecordAtFirst) {
  Timeline time;
  EXPECT_EQ(time.nextBin(), 0U);
  for (const uint64_t timestamp : {10U, 20U, 40U}) EXPECT_FALSE(time.add(timestamp));
  EXPECT_EQ(time.bin(), 2U);
  EXPECT_EQ(time.nextBin(), 3U);
}

TEST(Timeline, PlacesRecordsByTheirTimestamps) {
  Timeline time;
  for (const uint64_t timestamp : {10U, 20U, 40U}) time.add(timestamp);
  EXPECT_TRUE(time.isTime());
  EXPECT_EQ(time.first(), 10);
  EXPECT_EQ(time.last(), 55);  // 15 from one record to the next
  EXPECT_EQ(time.placeOf(0), 0);
  EXPECT_DOUBLE_EQ(time.placeOf(1), 10.0 / 45);
  EXPECT_DOUBLE_EQ(time.placeOf(2), 30.0 / 45);
  EXPECT_EQ(time.placeOf(3), 1);
}

TEST(Timeline, PlacesRecordsByNumberWhenTimestampsFallOrStandStill) {
  for (const uint64_t second : {5U, 10U}) {
    Timeline time;
    for (const uint64_t timestamp : {uint64_t{10}, second, uint64_t{10}, uint64_t{10}}) time.add(timestamp);
    EXPECT_FALSE(time.isTime());
    EXPECT_EQ(time.first(), 1);
    EXPECT_EQ(time.last(), 5);
    EXPECT_EQ(time.placeOf(1), 0.25);
    EXPECT_EQ(time.placeOf(4), 1);
  }
}

TEST(Timeline, FoldsItsBinsWhenAllAreInUse) {
  Timeline time;
  for (uint64_t i = 0; i < Timeline::kBins; ++i) ASSERT_FALSE(time.add(i));
  EXPECT_EQ(time.nextBin(), Timeline::kBins);
  EXPECT_TRUE(time.add(Timeline::kBins));
  EXPECT_EQ(time.bin(), Timeline::kBins / 2);
  EXPECT_FALSE(time.add(Timeline::kBins + 1));
  EXPECT_EQ(time.bin(), Timeline::kBins / 2);
  EXPECT_DOUBLE_EQ(time.placeOf(256), 512 / time.last());  // its first record is that with timestamp 512
}

TEST(Timeline, OfNoRecordsBeginsAndEndsAtOnce) {
  EXPECT_EQ(Timeline().placeOf(0), 0);
}

}  // namespace
}  // namespace senseloom::tool
