#include <gtest/gtest.h>
#include <warping.h>

#include <cstddef>
#include <cstdint>

namespace {

using gesture::Points;
using gesture::warpingDistance;

constexpr std::uint32_t kUnlimited = UINT32_MAX;

// Nothing but one point that is 5 from nothing: 40 in eighths.
Points spikeAt(std::size_t point) {
  Points points{};
  points[point] = {3, 0, 0, 0, -4, 0};
  return points;
}

TEST(WarpingDistance, OfADrawingToItselfIsNothing) {
  EXPECT_EQ(warpingDistance(spikeAt(7), spikeAt(7), kUnlimited), 0U);
}

TEST(WarpingDistance, IsTheSumOfTheDistancesOfPoints) {
  EXPECT_EQ(warpingDistance(spikeAt(7), Points{}, kUnlimited), 40U);
  EXPECT_EQ(warpingDistance(Points{}, spikeAt(7), kUnlimited), 40U);
  Points ones{};
  ones.fill({1, 0, 0, 0, 0, 0});
  EXPECT_EQ(warpingDistance(ones, Points{}, kUnlimited), 24U * 8U);
}

TEST(WarpingDistance, RoundsTheDistanceOfTwoPointsDown) {
  Points points{};
  points[5] = {1, 1, 1, 0, 0, 0};
  EXPECT_EQ(warpingDistance(points, Points{}, kUnlimited), 13U);  // 8 * 1.732 = 13.86
}

TEST(WarpingDistance, OfTheSameDrawnWithAnotherTimingIsNothing) {
  EXPECT_EQ(warpingDistance(spikeAt(5), spikeAt(8), kUnlimited), 0U);
  EXPECT_EQ(warpingDistance(spikeAt(8), spikeAt(5), kUnlimited), 0U);
  EXPECT_EQ(warpingDistance(spikeAt(5), spikeAt(11), kUnlimited), 0U);
}

TEST(WarpingDistance, MatchesNoPointsMoreThanSixApart) {
  EXPECT_EQ(warpingDistance(spikeAt(5), spikeAt(12), kUnlimited), 80U);
  EXPECT_EQ(warpingDistance(spikeAt(12), spikeAt(5), kUnlimited), 80U);
}

TEST(WarpingDistance, HoldsTheLargestValues) {
  Points most;
  Points least;
  most.fill({27, 27, 27, 27, 27, 27});
  least.fill({-27, -27, -27, -27, -27, -27});
  EXPECT_EQ(warpingDistance(most, least, kUnlimited), 24U * 1058U);  // 8 * sqrt(6 * 54 * 54) = 1058.2
}

TEST(WarpingDistance, IsOnlyKnownToBeAboveTheMostThatIsAskedFor) {
  EXPECT_EQ(warpingDistance(spikeAt(5), spikeAt(12), 80), 80U);
  EXPECT_GT(warpingDistance(spikeAt(5), spikeAt(12), 79), 79U);
  EXPECT_GT(warpingDistance(spikeAt(5), spikeAt(12), 0), 0U);
}

}  // namespace
