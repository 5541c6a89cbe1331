#include "session/session_gesture_hmm.h"

#include <gtest/gtest.h>

#include <string>

#include "allocations.h"
#include "delivery.h"
#include "fake_platform.h"
#include "option_text.h"

namespace senseloom {
namespace {

using Group = fake::Platform::Group;
using Log = std::vector<fake::LogLine>;
using Samples = std::vector<int16_t>;

constexpr int kDebug = 3;
constexpr int kError = 6;
const std::optional<Bytes> kNothing;

const char* const kNames[] = {"NumberOne ",  "NumberTwo ",  "NumberThree ", "NumberFour ",
                              "NumberFive ", "NumberSix ",  "NumberSeven ", "NumberEight ",
                              "NumberNine ", "NumberZero ", "LetterA ",     "LetterB ",
                              "LetterC ",    "LetterD ",    "LetterE ",     "LetterF "};

// Each record gets a timestamp of its own.
uint64_t newTimestamp() {
  static uint64_t last = 0x100;
  return ++last;
}

Bytes record(uint64_t timestamp, int prx, size_t size, const Samples& samples) {
  return joined(bytesOf(timestamp, static_cast<int16_t>(prx), static_cast<uint16_t>(size)), samples);
}
// ... of one group.
Bytes record(uint64_t timestamp, int prx = 0) {
  return record(timestamp, prx, 12, {1, 2, 3, 4, 5, 6});
}
Bytes withClass(Bytes data, uint16_t classNumber) {
  std::memcpy(data.data() + 8, &classNumber, sizeof classNumber);
  return data;
}

fake::LogLine groupLine(const std::string& text) {
  return {kDebug, "libsenseloom", text};
}
fake::LogLine nameLine(const std::string& name) {
  return {kDebug, "libsenseloom", "-- gesture: " + name};
}

class Gestures : public testing::Test {
 protected:
  void TearDown() override { engine() = {}; }

  // What a session delivers for a record that is not refused.
  static std::optional<Bytes> feed(Session& session, Bytes data) {
    const Delivery delivery(session, data);
    EXPECT_NE(delivery.result, -1);
    return delivery.bytes();
  }
  // ... of one group in which the engine finds a gesture.
  static std::optional<Bytes> feedGesture(Session& session, const std::string& name, Bytes data) {
    engine().gestureNames = {name};
    return feed(session, std::move(data));
  }

  static fake::Platform& engine() { return fake::platform(); }
};

// The first test, since timestamp 0 counts as fed only until another one was.
TEST_F(Gestures, FirstRecordWithTimestampZeroCountsAsFed) {
  SessionGestureHMM session;
  EXPECT_EQ(feedGesture(session, "LetterA ", record(0)), kNothing);
  EXPECT_EQ(engine().groups, std::vector<Group>{});
  EXPECT_EQ(engine().takeLog(), Log{});
  const uint64_t next = newTimestamp();
  EXPECT_EQ(feed(session, record(next)), withClass(record(next), 11));
  EXPECT_EQ(feedGesture(session, "LetterB ", record(0)), withClass(record(0), 12));
}

TEST_F(Gestures, SessionHasItsSensorsNameAndNothingToBuild) {
  SessionGestureHMM session;
  EXPECT_STREQ(session.name, "GSPX");
  EXPECT_EQ(session.buildProc(), 0);
}

TEST_F(Gestures, EngineRunsWhileThereAreSessions) {
  for (int round = 1; round <= 2; ++round) {
    auto one = std::make_unique<SessionGestureHMM>();
    auto two = std::make_unique<SessionGestureHMM>();
    auto three = std::make_unique<SessionGestureHMM>();
    one.reset();
    three.reset();
    auto four = std::make_unique<SessionGestureHMM>();
    two.reset();
    EXPECT_EQ(engine().gestureCloses, round - 1);
    four.reset();
    EXPECT_EQ(engine().gestureCloses, round);
    EXPECT_EQ(engine().gestureInitials, (std::vector<std::array<int, 2>>(static_cast<size_t>(round), {0, 0})));
  }
  EXPECT_EQ(engine().takeLog(), Log{});
}

TEST_F(Gestures, EngineThatDoesNotStartIsLoggedAndFedAllTheSame) {
  engine().gestureStarts = false;
  {
    SessionGestureHMM one;
    EXPECT_EQ(engine().takeLog(), (Log{{kError, "libsenseloom", "hmm gesture algorithm start return false"}}));
    SessionGestureHMM two;
    EXPECT_EQ(engine().takeLog(), Log{}) << "a further session does not start it again";
    const uint64_t timestamp = newTimestamp();
    EXPECT_EQ(feedGesture(two, "NumberOne ", record(timestamp)), withClass(record(timestamp), 1));
  }
  EXPECT_EQ(engine().gestureInitials.size(), 1U);
  EXPECT_EQ(engine().gestureCloses, 1);
}

TEST_F(Gestures, SessionThatCanNotBeMadeLeavesTheEngineAlone) {
  engine().gestureInitials.reserve(1);  // the fake is not to be what fails
  size_t failures = 0;
  for (;; ++failures) {
    const fake::FailingAllocation next(failures + 1);
    try {
      SessionGestureHMM session;
      break;
    } catch (const std::bad_alloc&) {
      EXPECT_EQ(engine().gestureInitials.size(), 0U);
      EXPECT_EQ(engine().gestureCloses, 0);
    }
  }
  EXPECT_GE(failures, 2U) << "the option and the result buffer at least are allocated";
  EXPECT_EQ(engine().gestureInitials.size(), 1U);
  EXPECT_EQ(engine().gestureCloses, 1);
}

TEST_F(Gestures, EachNameIsAClass) {
  SessionGestureHMM session;
  for (uint16_t classNumber = 1; classNumber <= 16; ++classNumber) {
    const Bytes data = record(newTimestamp());
    EXPECT_EQ(feedGesture(session, kNames[classNumber - 1], data), withClass(data, classNumber));
  }
}

TEST_F(Gestures, OtherNamesAreNone) {
  SessionGestureHMM session;
  for (const char* name :
       {"LetterA", "LetterA  ", " LetterA ", "letterA ", "LetterG ", "NumberTen ", "NumberOne", "", " "}) {
    EXPECT_EQ(feedGesture(session, name, record(newTimestamp())), kNothing) << name;
    ASSERT_EQ(engine().takeLog().back(), nameLine(name));
  }
}

TEST_F(Gestures, RecordWithoutAGestureIsDropped) {
  SessionGestureHMM session;
  EXPECT_EQ(feed(session, record(newTimestamp())), kNothing);
  EXPECT_EQ(engine().groups.size(), 1U);
  feedGesture(session, "LetterA ", record(newTimestamp()));
  EXPECT_EQ(feed(session, record(newTimestamp())), kNothing) << "the gesture before was the other record's";
}

TEST_F(Gestures, AreAcceptedWithPrxZeroAlone) {
  SessionGestureHMM session;
  for (const int prx : {1, -1, 256, -32768, 32767}) {
    EXPECT_EQ(feedGesture(session, "LetterA ", record(newTimestamp(), prx)), kNothing) << prx;
    EXPECT_EQ(engine().takeLog(),
              (Log{groupLine("num 0: 1 2 3 4 5 6: last 1, size 12, prx " + std::to_string(prx) + "\n"),
                   nameLine("LetterA ")}));
  }
}

TEST_F(Gestures, LastGroupAndEveryNameAreLogged) {
  SessionGestureHMM session;
  engine().gestureNames = {"LetterB ", std::nullopt, "noise"};
  const Bytes data =
      record(newTimestamp(), 0, 36, {1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 32767, -32768, -1, 0, 15, 16});
  EXPECT_EQ(feed(session, data), withClass(data, 12)) << "an unknown name takes nothing back";
  EXPECT_EQ(engine().takeLog(),
            (Log{nameLine("LetterB "), groupLine("num 2: 32767 -32768 -1 0 15 16: last 1, size 36, prx 0\n"),
                 nameLine("noise")}));
}

TEST_F(Gestures, LastNameOfARecordCounts) {
  SessionGestureHMM session;
  engine().gestureNames = {"LetterB ", "NumberZero ", "LetterG "};
  const Bytes data = record(newTimestamp(), 0, 36, Samples(18));
  EXPECT_EQ(feed(session, data), withClass(data, 10));
}

TEST_F(Gestures, SamplesAreFedGroupByGroup) {
  SessionGestureHMM session;
  feed(session, record(newTimestamp(), 0, 24, {1, -2, 3, -4, 5, -6, 32767, -32768, 9, 10, 11, 12}));
  EXPECT_EQ(engine().groups,
            (std::vector<Group>{{{1, -2, 3, -4, 5, -6}, 1, false}, {{32767, -32768, 9, 10, 11, 12}, 1, true}}));
}

TEST_F(Gestures, EveryStartedGroupIsFedAndAtLeastOne) {
  SessionGestureHMM session;
  struct {
    size_t size;
    size_t groups;
  } const cases[] = {{0, 1},  {1, 1},  {11, 1}, {12, 1}, {13, 2},    {24, 2},
                     {25, 3}, {30, 3}, {36, 3}, {37, 4}, {2040, 170}};
  for (const auto& [size, groups] : cases) {
    engine().groups.clear();
    engine().log.clear();
    feed(session, record(newTimestamp(), 0, size, Samples(1020)));
    ASSERT_EQ(engine().groups.size(), groups) << size;
    for (size_t k = 0; k < groups; ++k) EXPECT_EQ(engine().groups[k].last, k + 1 == groups) << size << ' ' << k;
    EXPECT_EQ(engine().takeLog(), (Log{groupLine("num " + std::to_string(groups - 1) + ": 0 0 0 0 0 0: last 1, size " +
                                                 std::to_string(size) + ", prx 0\n")}));
  }
}

TEST_F(Gestures, GroupThatTheRecordHoldsInPartIsCompletedWithZeros) {
  SessionGestureHMM session;
  feed(session, record(newTimestamp(), 0, 30, Samples(15, -1)));
  ASSERT_EQ(engine().groups.size(), 3U);
  EXPECT_EQ(engine().groups[2], (Group{{-1, -1, -1, 0, 0, 0}, 1, true}));
  EXPECT_EQ(engine().takeLog(), (Log{groupLine("num 2: -1 -1 -1 0 0 0: last 1, size 30, prx 0\n")}));

  engine().groups.clear();
  Bytes odd = record(newTimestamp(), 0, 13, Samples(6, -1));
  odd.push_back(0xFF);
  feed(session, odd);
  ASSERT_EQ(engine().groups.size(), 2U);
  EXPECT_EQ(engine().groups[1], (Group{{0xFF, 0, 0, 0, 0, 0}, 1, true}));
}

TEST_F(Gestures, GroupIsFedWithWhatTheRecordHoldsBehindItsSize) {
  SessionGestureHMM session;
  feed(session, record(newTimestamp(), 0, 0, {1, 2, 3, 4, 5, 6}));
  feed(session, record(newTimestamp(), 0, 14, {1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13}));
  EXPECT_EQ(engine().groups,
            (std::vector<Group>{
                {{1, 2, 3, 4, 5, 6}, 1, true}, {{1, 2, 3, 4, 5, 6}, 1, false}, {{7, 8, 9, 10, 11, 12}, 1, true}}));
}

TEST_F(Gestures, RecordWithTheTimestampOfTheOneBeforeIsNotFedAndHasItsClass) {
  SessionGestureHMM session;
  const uint64_t timestamp = newTimestamp();
  EXPECT_EQ(feedGesture(session, "LetterA ", record(timestamp)), withClass(record(timestamp), 11));
  engine().takeLog();
  const Bytes other = record(timestamp, 1, 24, Samples(12, 77));
  EXPECT_EQ(feedGesture(session, "LetterB ", other), withClass(other, 11)) << "with the second record's own bytes";
  EXPECT_EQ(engine().groups.size(), 1U);
  EXPECT_EQ(engine().takeLog(), Log{});
}

TEST_F(Gestures, TimestampsDifferInAnyBit) {
  SessionGestureHMM session;
  const uint64_t timestamp = newTimestamp();
  feed(session, record(timestamp));
  size_t fed = engine().groups.size();
  for (const uint64_t bit : {uint64_t{1} << 31, uint64_t{1} << 32, uint64_t{1} << 63}) {
    feed(session, record(timestamp ^ bit));
    EXPECT_EQ(engine().groups.size(), ++fed);
    feed(session, record(timestamp));
    EXPECT_EQ(engine().groups.size(), ++fed);
  }
}

TEST_F(Gestures, SessionsShareARecognitionAndFilterItApart) {
  SessionGestureHMM letters;
  SessionGestureHMM digits;
  SessionGestureHMM all;
  ASSERT_EQ(letters.parseOption(R"({"classMask":64512})"), 0);
  ASSERT_EQ(digits.parseOption(R"({"classMask":1023})"), 0);
  const Bytes letter = record(newTimestamp());
  EXPECT_EQ(feedGesture(letters, "LetterA ", letter), withClass(letter, 11));
  EXPECT_EQ(feed(digits, letter), kNothing);
  EXPECT_EQ(feed(all, letter), withClass(letter, 11));
  EXPECT_EQ(engine().groups.size(), 1U);

  const Bytes digit = record(newTimestamp());
  EXPECT_EQ(feedGesture(letters, "NumberZero ", digit), kNothing);
  EXPECT_EQ(feed(digits, digit), withClass(digit, 10));
  EXPECT_EQ(engine().groups.size(), 2U);
}

TEST_F(Gestures, MaskHasABitForEachClass) {
  for (int wanted = 1; wanted <= 16; ++wanted) {
    SessionGestureHMM session;
    ASSERT_EQ(session.parseOption(optionText({{"classMask", 1 << (wanted - 1)}}).c_str()), 0);
    for (int found = 1; found <= 16; ++found) {
      const auto result = feedGesture(session, kNames[found - 1], record(newTimestamp()));
      EXPECT_EQ(result.has_value(), found == wanted) << found << ' ' << wanted;
    }
  }
}

TEST_F(Gestures, RefusesUnreadableStringsAndKeepsItsOption) {
  SessionGestureHMM session;
  ASSERT_EQ(session.parseOption(R"({"classMask":1})"), 0);
  EXPECT_EQ(session.parseOption("no JSON"), -1);
  EXPECT_EQ(session.parseOption(nullptr), -1);
  EXPECT_EQ(feedGesture(session, "NumberTwo ", record(newTimestamp())), kNothing);
}

TEST_F(Gestures, LastRecognitionOutlivesTheEngine) {
  const uint64_t timestamp = newTimestamp();
  {
    SessionGestureHMM session;
    feedGesture(session, "LetterF ", record(timestamp));
  }
  EXPECT_EQ(engine().gestureCloses, 1);
  SessionGestureHMM session;
  EXPECT_EQ(feedGesture(session, "LetterA ", record(timestamp)), withClass(record(timestamp), 16));
  EXPECT_EQ(engine().groups.size(), 1U);
}

TEST_F(Gestures, RefusesBadRecordsAndStaysAsItWas) {
  SessionGestureHMM session;
  const uint64_t before = newTimestamp();
  feedGesture(session, "LetterA ", record(before));
  engine().groups.clear();
  engine().takeLog();
  engine().gestureNames = {"LetterB "};

  const uint64_t next = newTimestamp();
  for (const uint64_t timestamp : {next, before}) {
    std::vector<Bytes> refused = {record(timestamp, 0, 25, Samples(12)), record(timestamp, 0, 13, Samples(6)),
                                  record(timestamp, 0, 2041, Samples(1020)), record(timestamp, 0, 65535, Samples(1020)),
                                  record(timestamp, 0, 12, Samples(1021))};
    Bytes tooLong = record(timestamp, 0, 12, Samples(1020));
    tooLong.push_back(0);
    refused.push_back(tooLong);
    for (size_t len = 0; len < 24; ++len) refused.push_back(cut(record(timestamp, 0, 0, Samples(6)), len));
    for (Bytes& data : refused) EXPECT_EQ(Delivery(session, data).result, -1) << data.size();
  }
  EXPECT_EQ(engine().groups, std::vector<Group>{});
  EXPECT_EQ(engine().takeLog(), Log{});

  EXPECT_EQ(feed(session, record(before)), withClass(record(before), 11));
  EXPECT_EQ(feed(session, record(next)), withClass(record(next), 12));
}

TEST_F(Gestures, LargestRecordFits) {
  SessionGestureHMM session;
  Samples samples(1020);
  for (size_t i = 0; i < samples.size(); ++i) samples[i] = static_cast<int16_t>(i * 31);
  const Bytes data = record(newTimestamp(), 0, 2040, samples);
  ASSERT_EQ(data.size(), 2052U);
  EXPECT_EQ(feedGesture(session, "LetterA ", data), withClass(data, 11));
}

TEST_F(Gestures, AreDeliveredFromTheSamePlaceEachTime) {
  SessionGestureHMM session;
  Bytes first = record(newTimestamp());
  Bytes second = record(newTimestamp());
  engine().gestureNames = {"LetterA ", "LetterB "};
  const Bytes before = first;
  const Delivery one(session, first);
  const Delivery two(session, second);
  EXPECT_NE(one.out, first.data());
  EXPECT_EQ(one.out, two.out);
  EXPECT_EQ(two.bytes(), withClass(second, 12));
  EXPECT_EQ(first, before) << "the client's record stays as it is";
}

TEST_F(Gestures, EveryNameIsGivenBackToTheEnginesMemory) {
  const long before = fake::liveArrays();
  {
    SessionGestureHMM session;
    engine().gestureNames = {"LetterA ", "noise", std::nullopt, "", "LetterB "};
    feed(session, record(newTimestamp(), 0, 36, Samples(18)));
    feed(session, record(newTimestamp(), 1, 24, Samples(12)));
    EXPECT_TRUE(engine().gestureNames.empty());
    EXPECT_EQ(fake::liveArrays(), before);
  }
  EXPECT_EQ(fake::liveArrays(), before);
}

}  // namespace
}  // namespace senseloom
