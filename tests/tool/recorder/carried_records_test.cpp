#include "recorder/carried_records.h"

#include <gtest/gtest.h>

#include <string>

namespace senseloom::trace {
namespace {

using Lines = std::vector<std::string>;

TEST(CarriedRecordsTest, AreThoseSinceTheLastResultButOne) {
  CarriedRecords carried;
  carried.opened(1);
  const auto dispatched = [&carried](const char* line, bool gaveResult) { carried.dispatched(1, line, gaveResult); };
  dispatched("1\n", false);
  dispatched("2\n", true);
  dispatched("3\n", false);
  EXPECT_EQ(carried.lines(), (Lines{"1\n", "2\n", "3\n"}));
  dispatched("4\n", true);
  dispatched("5\n", false);
  EXPECT_EQ(carried.lines(), (Lines{"3\n", "4\n", "5\n"}));
  carried.restarted({1});
  EXPECT_EQ(carried.lines(), Lines{});
  dispatched("6\n", false);
  carried.closed(1);
  EXPECT_EQ(carried.lines(), Lines{});
}

TEST(CarriedRecordsTest, OfASessionThatWasOpenBeforeAreKnownAfterTwoResults) {
  CarriedRecords carried;
  carried.found(1);
  EXPECT_FALSE(carried.isWhole(1));
  carried.dispatched(1, "1\n", true);
  EXPECT_FALSE(carried.isWhole(1));
  EXPECT_EQ(carried.lines(), Lines{});
  carried.dispatched(1, "2\n", true);
  EXPECT_TRUE(carried.isWhole(1));
  EXPECT_EQ(carried.lines(), Lines{"2\n"});
  carried.found(1);
  carried.restarted({1});
  EXPECT_TRUE(carried.isWhole(1));
}

TEST(CarriedRecordsTest, AreInTheOrderOfTheirDispatches) {
  CarriedRecords carried;
  const uint32_t sessions[] = {3, 1, 4, 2};
  for (const uint32_t session : sessions) carried.opened(session);
  Lines dispatched;
  for (int record = 0; record < 3; ++record) {
    for (const uint32_t session : sessions) {
      dispatched.push_back(std::to_string(record) + " to " + std::to_string(session) + '\n');
      carried.dispatched(session, dispatched.back(), session == 4 && record == 0);
    }
  }
  EXPECT_EQ(carried.lines(), dispatched);
}

TEST(CarriedRecordsTest, AreGivenUpWhenTheyAreTooMany) {
  CarriedRecords carried;
  carried.opened(1);
  const std::string line = std::string(999, 'x') + '\n';
  for (int i = 0; i < 66; ++i) carried.dispatched(1, line, false);
  EXPECT_FALSE(carried.isWhole(1));
  carried.dispatched(1, line, true);
  EXPECT_FALSE(carried.isWhole(1));
  carried.dispatched(1, line, true);
  EXPECT_TRUE(carried.isWhole(1));
}

}  // namespace
}  // namespace senseloom::trace
