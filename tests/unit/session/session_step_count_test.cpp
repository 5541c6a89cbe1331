#include "session/session_step_count.h"

#include <gtest/gtest.h>

#include <limits>

#include "delivery.h"

namespace senseloom {
namespace {

constexpr int32_t kLeast = std::numeric_limits<int32_t>::min();
constexpr int32_t kMost = std::numeric_limits<int32_t>::max();

class StepCount : public testing::Test {
 protected:
  bool passes(int32_t steps) {
    Bytes record = bytesOf(uint64_t{81}, steps);
    const Delivery delivery(session, record);
    if (delivery.result == 0) return false;
    EXPECT_EQ(delivery.result, 1);
    EXPECT_EQ(delivery.out, record.data());
    EXPECT_EQ(delivery.outLen, 12);
    return true;
  }
  void expect(std::initializer_list<int32_t> delivered, std::initializer_list<int32_t> dropped) {
    for (const int32_t steps : delivered) EXPECT_TRUE(passes(steps)) << steps;
    for (const int32_t steps : dropped) EXPECT_FALSE(passes(steps)) << steps;
  }

  SessionStepCount session;
};

TEST_F(StepCount, HasItsSensorsName) {
  EXPECT_STREQ(session.name, "SCOUN");
}

TEST_F(StepCount, ReportsEveryUpdateByDefault) {
  expect({0, 1, 99, 100, 150, -1, kLeast, kMost}, {});
}

TEST_F(StepCount, ReportsEveryUpdateInModeOne) {
  EXPECT_EQ(session.parseOption(R"({"mode":1,"logN":3})"), 0);
  expect({0, 1, 99, 100, 150, -1, kLeast, kMost}, {});
}

TEST_F(StepCount, ReportsHundredsInModeZero) {
  EXPECT_EQ(session.parseOption(R"({"mode":0,"logN":1})"), 0);
  expect({0, 100, 200, -100, 2147483600, -2147483600}, {1, 99, 150, 101, -1, -99, kLeast, kMost});
}

TEST_F(StepCount, ReportsMultiplesOfLogNHundredsInModeZero) {
  EXPECT_EQ(session.parseOption(R"({"mode":0,"logN":3})"), 0);
  expect({0, 300, 600, -900}, {100, 200, 400, -100, 800});
  EXPECT_EQ(session.parseOption(R"({"mode":0,"logN":100})"), 0);
  expect({0, 10000, -20000}, {300, 5000, 10001});
}

TEST_F(StepCount, ShortRecordsPassInModeOneAlone) {
  for (size_t len = 0; len < 12; ++len) {
    Bytes record = cut(Bytes(12), len);
    session.parseOption(R"({"mode":0})");
    EXPECT_EQ(Delivery(session, record).result, 0) << len;
    session.parseOption(R"({"mode":1})");
    const Delivery delivery(session, record);
    EXPECT_EQ(delivery.result, 1) << len;
    EXPECT_EQ(delivery.out, record.data());
    EXPECT_EQ(delivery.outLen, static_cast<int>(len));
  }
}

TEST_F(StepCount, AcceptsEveryStringAndKeepsItsOptionWhenItCanNotBeRead) {
  EXPECT_EQ(session.parseOption(R"({"mode":0,"logN":2})"), 0);
  for (const char* text : {"no JSON", "", static_cast<const char*>(nullptr)}) EXPECT_EQ(session.parseOption(text), 0);
  expect({200}, {100, 201});
}

TEST_F(StepCount, HasNothingToBuild) {
  EXPECT_EQ(session.buildProc(), 0);
}

}  // namespace
}  // namespace senseloom
