#include "trace/human_time.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <string>
#include <vector>

#include "trace/time_unit.h"

namespace senseloom::tool {
namespace {

TEST(HumanTime, IsADurationADateOrDays) {
  EXPECT_EQ(humanTime(0, kSecond), "0:00:00");
  EXPECT_EQ(humanTime(24'630'065, kMillisecond), "6:50:30.065");
  EXPECT_EQ(humanTime(1'500'000, 1000), "0:00:01.500");
  EXPECT_EQ(humanTime(1, 1), "0:00:00.000000001");
  EXPECT_EQ(humanTime(99 * 3600, kSecond), "99:00:00");
  EXPECT_EQ(humanTime(100 * 3600 + 1, kSecond), "4 d 4:00:01");
  EXPECT_EQ(humanTime(1'795'305'600'250, kMillisecond), "2026-11-22 0:00:00.250");
  EXPECT_EQ(humanTime(UINT64_MAX, kSecond), "213503982334601 d 7:00:15");
}

TEST(TimeMarks, AreRoundTimes) {
  const auto marks = [](uint64_t first, uint64_t last, int64_t unit) { return timeMarks(first, last, unit, 8); };
  EXPECT_EQ(marks(3600, 10800, kSecond), (std::vector<uint64_t>{3600, 5400, 7200, 9000, 10800}));
  EXPECT_EQ(marks(999, 3001, kMillisecond), (std::vector<uint64_t>{1000, 1500, 2000, 2500, 3000}));
  EXPECT_EQ(marks(7, 10, kSecond), (std::vector<uint64_t>{7, 8, 9, 10}));
  EXPECT_EQ(marks(0, 30 * 86400, kSecond),
            (std::vector<uint64_t>{0, 5 * 86400, 10 * 86400, 15 * 86400, 20 * 86400, 25 * 86400, 30 * 86400}));
  EXPECT_EQ(marks(UINT64_MAX - 2, UINT64_MAX, 1), (std::vector<uint64_t>{UINT64_MAX - 2, UINT64_MAX - 1, UINT64_MAX}));
}

}  // namespace
}  // namespace senseloom::tool
