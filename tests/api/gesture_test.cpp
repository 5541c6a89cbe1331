#include "client.h"

// Hand-drawn gestures: one engine for all sessions, fed once with each record.
namespace api {
namespace {

using Samples = std::array<int16_t, 6>;

// A record whose samples are counted up from 1, `length` bytes long.
Bytes drawn(uint64_t timestamp, int16_t prx, uint16_t size, size_t length) {
  Bytes bytes = record(timestamp, prx, size);
  for (int16_t sample = 1; bytes.size() < length; ++sample) append(bytes, sample);
  bytes.resize(length);
  return bytes;
}

// The result made of a record: it holds the class instead of `prx`.
Delivery recognised(Bytes bytes, uint16_t classNumber) {
  std::memcpy(bytes.data() + 8, &classNumber, sizeof classNumber);
  return made(std::move(bytes));
}

// Answers of the engine.
void willRecognise(const std::string& name) {
  platform().gestureNames.push_back(name);
}
void willRecogniseNothing() {
  platform().gestureNames.push_back(std::nullopt);
}

TEST(Gesture, DeliversTheRecordWithTheNumberOfTheRecognisedClass) {
  const char* const names[] = {"NumberOne ",  "NumberTwo ",  "NumberThree ", "NumberFour ",
                               "NumberFive ", "NumberSix ",  "NumberSeven ", "NumberEight ",
                               "NumberNine ", "NumberZero ", "LetterA ",     "LetterB ",
                               "LetterC ",    "LetterD ",    "LetterE ",     "LetterF "};
  void* const handle = ctx_open_session("GSPX");
  uint16_t classNumber = 0;
  for (const char* name : names) {
    ++classNumber;
    willRecognise(name);
    const Bytes bytes = drawn(classNumber, 0, 12, 24);
    EXPECT_EQ(dispatch(handle, bytes), recognised(bytes, classNumber)) << name;
    EXPECT_EQ(platform().takeLog(),
              (Log{debug("num 0: 1 2 3 4 5 6: last 1, size 12, prx 0\n"), debug(std::string("-- gesture: ") + name)}));
  }
  EXPECT_EQ(closeSession(handle), kStopped);
}

TEST(Gesture, IsNoneUnlessTheNameIsExactlyThatOfAClass) {
  void* const handle = ctx_open_session("GSPX");
  uint64_t timestamp = 0;
  for (const char* name : {"LetterA", "letterA ", "LetterA  ", "", " ", "LetterG ", "NumberTen "}) {
    willRecognise(name);
    EXPECT_EQ(dispatch(handle, drawn(++timestamp, 0, 12, 24)), kNothing) << name;
    EXPECT_EQ(platform().takeLog().back(), debug(std::string("-- gesture: ") + name));
  }
  EXPECT_EQ(dispatch(handle, drawn(++timestamp, 0, 12, 24)), kNothing);  // no name at all
  EXPECT_EQ(platform().takeLog(), Log{debug("num 0: 1 2 3 4 5 6: last 1, size 12, prx 0\n")});
}

TEST(Gesture, IsFilteredByTheClientsOwnMask) {
  void* const handle = ctx_open_session("GSPX");
  setOption(handle, R"({"classMask": 1024})");
  void* const other = ctx_open_session("GSPX");
  setOption(other, R"({"classMask": 31743})");  // all but class 11 and 16
  willRecognise("LetterA ");
  const Bytes letterA = drawn(1, 0, 12, 24);
  EXPECT_EQ(dispatch(handle, letterA), recognised(letterA, 11));
  EXPECT_EQ(dispatch(other, letterA), kNothing);
  willRecognise("LetterE ");
  const Bytes letterE = drawn(2, 0, 12, 24);
  EXPECT_EQ(dispatch(handle, letterE), kNothing);
  EXPECT_EQ(dispatch(other, letterE), recognised(letterE, 15));
}

TEST(Gesture, IsLoggedButNotTakenWhilePrxIsNot0) {
  void* const handle = ctx_open_session("GSPX");
  for (const int16_t prx : std::initializer_list<int16_t>{1, -1, 256, INT16_MIN}) {
    willRecognise("LetterA ");
    EXPECT_EQ(dispatch(handle, drawn(static_cast<uint16_t>(prx), prx, 12, 24)), kNothing);
    EXPECT_EQ(platform().takeLog(),
              (Log{debug("num 0: 1 2 3 4 5 6: last 1, size 12, prx " + std::to_string(prx) + "\n"),
                   debug("-- gesture: LetterA ")}));
  }
}

TEST(Gesture, LastMatchOfARecordCounts) {
  void* const handle = ctx_open_session("GSPX");
  willRecognise("LetterA ");
  willRecognise("NumberZero ");
  willRecognise("nonsense");
  willRecogniseNothing();
  const Bytes bytes = drawn(1, 0, 48, 60);
  EXPECT_EQ(dispatch(handle, bytes), recognised(bytes, 10));
  EXPECT_EQ(platform().takeLog(),
            (Log{debug("-- gesture: LetterA "), debug("-- gesture: NumberZero "), debug("-- gesture: nonsense"),
                 debug("num 3: 19 20 21 22 23 24: last 1, size 48, prx 0\n")}));
}

TEST(Gesture, NothingIsLeftOfItInTheNextRecord) {
  void* const handle = ctx_open_session("GSPX");
  willRecognise("LetterA ");
  EXPECT_EQ(dispatch(handle, drawn(1, 0, 12, 24)).result, 1);
  EXPECT_EQ(dispatch(handle, drawn(2, 0, 12, 24)), kNothing);
}

TEST(GestureEngine, IsFedGroupByGroup) {
  using Groups = std::vector<fake::Platform::Group>;
  const struct {
    uint16_t size;
    size_t length;
    Groups groups;
    std::string lastOne;
  } records[] = {
      {0, 24, {{{1, 2, 3, 4, 5, 6}, 1, true}}, "num 0: 1 2 3 4 5 6"},  // one group even then
      {11, 24, {{{1, 2, 3, 4, 5, 6}, 1, true}}, "num 0: 1 2 3 4 5 6"},
      {12, 36, {{{1, 2, 3, 4, 5, 6}, 1, true}}, "num 0: 1 2 3 4 5 6"},
      {13, 36, {{{1, 2, 3, 4, 5, 6}, 1, false}, {{7, 8, 9, 10, 11, 12}, 1, true}}, "num 1: 7 8 9 10 11 12"},
      {30,
       48,
       {{{1, 2, 3, 4, 5, 6}, 1, false}, {{7, 8, 9, 10, 11, 12}, 1, false}, {{13, 14, 15, 16, 17, 18}, 1, true}},
       "num 2: 13 14 15 16 17 18"},
      // What the record lacks of its last group is zero: here half of it, and half of a sample.
      {30,
       42,
       {{{1, 2, 3, 4, 5, 6}, 1, false}, {{7, 8, 9, 10, 11, 12}, 1, false}, {{13, 14, 15, 0, 0, 0}, 1, true}},
       "num 2: 13 14 15 0 0 0"},
      {15, 27, {{{1, 2, 3, 4, 5, 6}, 1, false}, {{7, 8, 0, 0, 0, 0}, 1, true}}, "num 1: 7 8 0 0 0 0"},
  };
  void* const handle = ctx_open_session("GSPX");
  uint64_t timestamp = 0;
  for (const auto& [size, length, groups, lastOne] : records) {
    platform().groups.clear();
    EXPECT_EQ(dispatch(handle, drawn(++timestamp, 0, size, length)), kNothing);
    EXPECT_EQ(platform().groups, groups) << size;
    EXPECT_EQ(platform().takeLog(), Log{debug(lastOne + ": last 1, size " + std::to_string(size) + ", prx 0\n")});
  }
}

TEST(GestureEngine, TakesTheLargestRecord) {
  void* const handle = ctx_open_session("GSPX");
  const Bytes largest = drawn(1, 0, 2040, 2052);
  platform().gestureNames.assign(169, std::nullopt);
  willRecognise("LetterF ");
  EXPECT_EQ(dispatch(handle, largest), recognised(largest, 16));
  EXPECT_EQ(platform().groups.size(), 170U);
  EXPECT_TRUE(platform().groups.back().last);
}

TEST(GestureEngine, NegativeSamplesAreLoggedWithTheirSign) {
  void* const handle = ctx_open_session("GSPX");
  EXPECT_EQ(dispatch(handle, record(1, int16_t{0}, uint16_t{12}, int16_t{-1}, int16_t{INT16_MIN}, int16_t{INT16_MAX},
                                    int16_t{0}, int16_t{-256}, int16_t{7})),
            kNothing);
  EXPECT_EQ(platform().takeLog(), Log{debug("num 0: -1 -32768 32767 0 -256 7: last 1, size 12, prx 0\n")});
}

TEST(GestureEngine, IsFedOnceWithARecordThatSeveralSessionsGet) {
  void* const first = ctx_open_session("GSPX");
  void* const second = ctx_open_session("GSPX");
  willRecognise("NumberTwo ");
  const Bytes bytes = drawn(0x100000000, 0, 12, 24);  // the upper word of the timestamp counts, too
  EXPECT_EQ(dispatch(first, bytes), recognised(bytes, 2));
  EXPECT_EQ(dispatch(second, bytes), recognised(bytes, 2));
  EXPECT_EQ(platform().groups.size(), 1U);
  EXPECT_EQ(platform().takeLog().size(), 2U);

  // A record of the same time is taken for the same one, whatever it holds.
  const Bytes sameTime = drawn(0x100000000, 5, 24, 36);
  EXPECT_EQ(dispatch(first, sameTime), recognised(sameTime, 2));
  EXPECT_EQ(platform().groups.size(), 1U);
  willRecognise("NumberThree ");
  const Bytes next = drawn(0x200000000, 0, 12, 24);
  EXPECT_EQ(dispatch(second, next), recognised(next, 3));
}

TEST(GestureEngine, IsNotFedWithRefusedRecords) {
  void* const handle = ctx_open_session("GSPX");
  willRecognise("NumberOne ");
  const Bytes bytes = drawn(1, 0, 12, 24);
  EXPECT_EQ(dispatch(handle, bytes), recognised(bytes, 1));
  platform().groups.clear();
  platform().takeLog();

  for (const Bytes& bad :
       {Bytes{}, Bytes(12), drawn(2, 0, 0, 23), drawn(2, 0, 13, 24), drawn(2, 0, 65535, 2052), drawn(2, 0, 12, 2053)}) {
    EXPECT_EQ(dispatch(handle, bad), kRefused) << bad.size();
  }
  EXPECT_EQ(platform().groups.size(), 0U);
  EXPECT_EQ(platform().takeLog(), Log{});
  EXPECT_EQ(dispatch(handle, bytes), recognised(bytes, 1));  // the last record is still the last one
  EXPECT_EQ(platform().groups.size(), 0U);
}

TEST(GestureEngine, IsNotFedWithAFirstRecordOfTime0) {
  void* const handle = ctx_open_session("GSPX");
  willRecognise("NumberOne ");
  EXPECT_EQ(dispatch(handle, drawn(0, 0, 12, 24)), kNothing);
  EXPECT_EQ(platform().groups.size(), 0U);
  const Bytes later = drawn(1, 0, 12, 24);
  EXPECT_EQ(dispatch(handle, later), recognised(later, 1));
}

TEST(GestureEngine, RunsWhileThereAreSessions) {
  using Initials = std::vector<std::array<int, 2>>;
  void* const first = ctx_open_session("GSPX");
  EXPECT_EQ(platform().gestureInitials, (Initials{{0, 0}}));
  void* const second = ctx_open_session("GSPX");
  void* const third = ctx_open_session("GSPX");
  EXPECT_EQ(closeSession(first), (Negotiated{1, Properties{}}));
  EXPECT_EQ(closeSession(third), (Negotiated{1, Properties{}}));
  EXPECT_EQ(platform().gestureCloses, 0);
  EXPECT_EQ(closeSession(second), kStopped);
  EXPECT_EQ(platform().gestureCloses, 1);
  EXPECT_EQ(platform().gestureInitials, (Initials{{0, 0}}));

  void* const again = ctx_open_session("GSPX");
  EXPECT_EQ(platform().gestureInitials, (Initials{{0, 0}, {0, 0}}));
  EXPECT_EQ(closeSession(again), kStopped);
  EXPECT_EQ(platform().gestureCloses, 2);
}

TEST(GestureEngine, StartedAnewStillKnowsTheLastRecord) {
  void* const first = ctx_open_session("GSPX");
  willRecognise("NumberFour ");
  const Bytes bytes = drawn(7, 0, 12, 24);
  EXPECT_EQ(dispatch(first, bytes), recognised(bytes, 4));
  EXPECT_EQ(closeSession(first), kStopped);

  void* const second = ctx_open_session("GSPX");
  EXPECT_EQ(dispatch(second, bytes), recognised(bytes, 4));
  EXPECT_EQ(platform().groups.size(), 1U);
}

TEST(GestureEngine, ThatDoesNotStartIsLoggedAndFedAllTheSame) {
  platform().gestureStarts = false;
  void* const handle = ctx_open_session("GSPX");
  ASSERT_NE(handle, nullptr);
  EXPECT_EQ(platform().takeLog(), Log{error("hmm gesture algorithm start return false")});
  void* const second = ctx_open_session("GSPX");
  EXPECT_EQ(platform().takeLog(), Log{});  // only the first session starts it
  EXPECT_EQ(platform().gestureInitials.size(), 1U);

  willRecognise("NumberFive ");
  const Bytes bytes = drawn(1, 0, 12, 24);
  EXPECT_EQ(dispatch(second, bytes), recognised(bytes, 5));
}

}  // namespace
}  // namespace api
