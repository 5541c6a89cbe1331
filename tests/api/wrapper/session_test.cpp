#include <fake_platform.h>
#include <gtest/gtest.h>

#include <climits>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <senseloom.hpp>
#include <span>
#include <string>
#include <type_traits>
#include <utility>
#include <vector>

#include "bytes_of.h"
#include "without_exceptions.h"

namespace {

using fake::platform;
using senseloom::CloseOutcome;
using senseloom::DispatchOutcome;
using senseloom::Session;

static_assert(!std::is_copy_constructible_v<Session>);
static_assert(!std::is_copy_assignable_v<Session>);
static_assert(std::is_nothrow_move_constructible_v<Session>);
static_assert(std::is_nothrow_move_assignable_v<Session>);

// What the aware audio device sees of the first session of LPE_P being opened, and of the last being closed.
const std::vector<std::string> kStarted = {"get aware.primary", "open aware_hw_if", "activate"};
const std::vector<std::string> kStartedAndStopped = {"get aware.primary", "open aware_hw_if", "activate", "deactivate",
                                                     "close"};

Bytes copyOf(std::span<const uint8_t> bytes) {
  return {bytes.begin(), bytes.end()};
}

TEST(WrapperSession, OpensASensorByName) {
  EXPECT_TRUE(Session::open("PHYAC"));
  EXPECT_TRUE(Session::open(std::string("PDR")));
}

TEST(WrapperSession, IsEmptyWhenThereIsNoSuchSensor) {
  EXPECT_FALSE(Session::open("PHYSICAL"));
  EXPECT_FALSE(Session::open(nullptr));
}

TEST(WrapperSession, IsEmptyWhenTheSensorDoesNotStart) {
  platform().getResult = -2;
  EXPECT_FALSE(Session::open("LPE_P"));
}

TEST(WrapperSession, RefusesEveryCallWhileEmpty) {
  Session session;
  EXPECT_EQ(session.handle(), nullptr);
  const auto negotiated = session.setOption("{}");
  EXPECT_FALSE(negotiated);
  EXPECT_FALSE(negotiated.properties);
  EXPECT_EQ(session.dispatch(Bytes(10)).outcome, DispatchOutcome::refused);
  const auto closed = session.close();
  EXPECT_EQ(closed.outcome, CloseOutcome::failed);
  EXPECT_FALSE(closed.properties);
}

TEST(WrapperSession, TellsWhetherAnOptionWasAccepted) {
  auto session = Session::open("PHYAC");
  EXPECT_TRUE(session.setOption("{}"));
  EXPECT_TRUE(session.setOption(std::string(R"({"logN": 3})")));
  const auto refused = session.setOption("{");
  EXPECT_FALSE(refused);
  EXPECT_FALSE(refused.properties);
}

TEST(WrapperSession, HasAHandleForTheCInterface) {
  const auto session = Session::open("SCOUN");
  ctx_option_t* list = nullptr;
  ASSERT_EQ(ctx_set_option(session.handle(), 0, "{}", &list), 0);
  EXPECT_EQ(senseloom::PropertyList(list).size(), 2U);
}

TEST(WrapperSession, DeliversTheRecordThatWasPassedInWhereItStands) {
  auto session = Session::open("SCOUN");
  const Bytes record = bytesOf(uint64_t{81}, int32_t{200});
  const auto [outcome, result] = session.dispatch(record);
  EXPECT_EQ(outcome, DispatchOutcome::delivered);
  EXPECT_EQ(result.data(), record.data());
  EXPECT_EQ(result.size(), 12U);
}

TEST(WrapperSession, DeliversAResultFromItsOwnStorage) {
  auto session = Session::open("PHYAC");
  ASSERT_TRUE(session.setOption(R"({"logN": 1})"));
  // Two records of one item each make a batch of two, whose class wins.
  Bytes record = bytesOf(uint64_t{81}, int16_t{1}, uint16_t{0x03});
  EXPECT_EQ(session.dispatch(record).outcome, DispatchOutcome::nothing);
  record = bytesOf(uint64_t{82}, int16_t{1}, uint16_t{0x13});
  const auto [outcome, result] = session.dispatch(record);
  EXPECT_EQ(outcome, DispatchOutcome::delivered);
  ASSERT_EQ(result.size(), 12U);
  EXPECT_NE(result.data(), record.data());
  EXPECT_EQ(copyOf(result.first(10)), bytesOf(uint64_t{82}, int16_t{1}));
}

TEST(WrapperSession, DeliversNothingForARecordThatItsClientDoesNotWant) {
  auto session = Session::open("SCOUN");
  ASSERT_TRUE(session.setOption(R"({"mode": 0, "logN": 2})"));
  const auto [outcome, result] = session.dispatch(bytesOf(uint64_t{81}, int32_t{100}));
  EXPECT_EQ(outcome, DispatchOutcome::nothing);
  EXPECT_EQ(result.data(), nullptr);
}

TEST(WrapperSession, RefusesARecordThatItsSensorRefuses) {
  auto session = Session::open("PDR");
  const auto [outcome, result] = session.dispatch(Bytes(9));
  EXPECT_EQ(outcome, DispatchOutcome::refused);
  EXPECT_EQ(result.data(), nullptr);
}

TEST(WrapperSession, TakesARecordOfNoBytes) {
  auto session = Session::open("SHAKI");
  const auto [outcome, result] = session.dispatch({});
  EXPECT_EQ(outcome, DispatchOutcome::delivered);
  EXPECT_EQ(result.data(), nullptr);
  EXPECT_TRUE(result.empty());
}

#if SIZE_MAX > UINT_MAX  // else every such length is negative as an int
TEST(WrapperSession, RefusesARecordWhoseLengthWouldBecomeAnother) {
  auto session = Session::open("SHAKI");
  const uint8_t byte = 0;
  EXPECT_EQ(session.dispatch({&byte, std::size_t{UINT_MAX} + 2}).outcome, DispatchOutcome::refused);
}
#endif

TEST(WrapperSession, TellsOnClosingThatSessionsRemainAndWhatTheirSensorIsToRunWith) {
  auto first = Session::open("SCOUN");
  auto second = Session::open("SCOUN");
  ASSERT_TRUE(first.setOption(R"({"logN": 7})"));
  ASSERT_TRUE(second.setOption(R"({"logN": 5})"));
  const auto closed = second.close();
  EXPECT_EQ(closed.outcome, CloseOutcome::sessionsRemain);
  ASSERT_EQ(closed.properties.size(), 2U);
  EXPECT_EQ(closed.properties[1].asInt(), 7);
  EXPECT_FALSE(second);
  EXPECT_TRUE(first);
}

TEST(WrapperSession, TellsOnClosingThatTheSensorStopped) {
  auto session = Session::open("LPE_P");
  EXPECT_EQ(platform().calls, kStarted);
  const auto closed = session.close();
  EXPECT_EQ(closed.outcome, CloseOutcome::sensorStopped);
  EXPECT_FALSE(closed.properties);
  EXPECT_FALSE(session);
  EXPECT_EQ(platform().calls, kStartedAndStopped);
}

TEST(WrapperSession, IsEmptyEvenWhenClosingFailed) {
  auto session = Session::open("LPE_P");
  platform().deactivateResult = -5;
  EXPECT_EQ(session.close().outcome, CloseOutcome::failed);
  EXPECT_FALSE(session);
}

TEST(WrapperSession, IsClosedOnceWhenDestroyed) {
  {
    auto session = Session::open("LPE_P");
    EXPECT_EQ(platform().calls, kStarted);
  }
  EXPECT_EQ(platform().calls, kStartedAndStopped);
}

TEST(WrapperSession, IsNotClosedAgainWhenDestroyedAfterClosing) {
  {
    auto session = Session::open("LPE_P");
    session.close();
  }
  EXPECT_EQ(platform().calls, kStartedAndStopped);
}

TEST(WrapperSession, StaysOpenWhenMovedAndLeavesAnEmptyOneBehind) {
  auto session = Session::open("LPE_P");
  void* const handle = session.handle();
  {
    Session moved(std::move(session));
    EXPECT_EQ(moved.handle(), handle);
    session = std::move(moved);
    EXPECT_FALSE(moved);  // NOLINT(bugprone-use-after-move): what is left is the question
  }
  EXPECT_EQ(session.handle(), handle);
  EXPECT_EQ(platform().calls, kStarted);
}

TEST(WrapperSession, IsClosedWhenAnotherIsAssignedToIt) {
  auto session = Session::open("LPE_P");
  session = Session::open("PHYAC");
  EXPECT_EQ(platform().calls, kStartedAndStopped);
  EXPECT_TRUE(session.setOption("{}"));
}

TEST(WrapperSession, WorksWithoutExceptionsAndTypeInformation) {
  EXPECT_EQ(sumWithoutExceptions("LPE_P", R"({"interval": 1000})"), 1042);
  EXPECT_EQ(sumWithoutExceptions("LPE_P", "{"), -1);
}

}  // namespace
