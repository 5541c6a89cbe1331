#include "session/session_pdr.h"

#include <gtest/gtest.h>

#include "delivery.h"
#include "option_text.h"

namespace senseloom {
namespace {

constexpr size_t kItemSize = 28;
const std::optional<Bytes> kNothing;

// Items whose bytes count on from `first` on.
Bytes items(int first, int count) {
  Bytes bytes;
  for (int i = first; i < first + count; ++i) {
    for (size_t b = 0; b < kItemSize; ++b)
      bytes.push_back(static_cast<uint8_t>(static_cast<size_t>(i) * kItemSize + b));
  }
  return bytes;
}

Bytes record(uint64_t timestamp, int first, int count) {
  return joined(bytesOf(timestamp, static_cast<int16_t>(count)), items(first, count));
}

class DeadReckoning : public testing::Test {
 protected:
  void setN(int n) { ASSERT_EQ(session.parseOption(optionText({{"N", n}}).c_str()), 0); }

  // What is delivered for a record that is not refused.
  std::optional<Bytes> feed(Bytes data) {
    const Delivery delivery(session, data);
    EXPECT_NE(delivery.result, -1);
    return delivery.bytes();
  }

  SessionPDR session;
};

TEST_F(DeadReckoning, HasItsSensorsNameAndNothingToBuild) {
  EXPECT_STREQ(session.name, "PDR");
  EXPECT_EQ(session.buildProc(), 0);
}

TEST_F(DeadReckoning, RefusesUnreadableStringsAndKeepsItsOption) {
  setN(1);
  EXPECT_EQ(session.parseOption("no JSON"), -1);
  EXPECT_EQ(session.parseOption(nullptr), -1);
  EXPECT_EQ(feed(record(1, 0, 1)), kNothing);
  EXPECT_EQ(feed(record(2, 1, 1)), record(2, 0, 2));
}

TEST_F(DeadReckoning, DeliversEveryRecordByDefault) {
  EXPECT_EQ(feed(record(0xF122334455667788, 3, 1)), record(0xF122334455667788, 3, 1));
  EXPECT_EQ(feed(record(2, 5, 3)), record(2, 5, 3));
}

TEST_F(DeadReckoning, GathersTwoToTheNItems) {
  setN(2);
  for (int batch = 0; batch < 2; ++batch) {
    for (uint64_t i = 1; i <= 3; ++i) EXPECT_EQ(feed(record(i, static_cast<int>(i), 1)), kNothing) << i;
    const auto result = feed(record(4, 4, 1));
    EXPECT_EQ(result, record(4, 1, 4));
    EXPECT_EQ(result->size(), 122U);
  }
}

TEST_F(DeadReckoning, GathersUpToSixtyFourItems) {
  setN(6);
  for (int i = 0; i < 63; ++i) EXPECT_EQ(feed(record(1, i, 1)), kNothing) << i;
  EXPECT_EQ(feed(record(2, 63, 1)), record(2, 0, 64));
}

TEST_F(DeadReckoning, TakesSixtyFourItemsAtOnce) {
  EXPECT_EQ(feed(record(1, 0, 64)), record(1, 0, 64));
}

TEST_F(DeadReckoning, DeliversAllItemsWhenThereAreMoreThanItWaitedFor) {
  setN(1);
  EXPECT_EQ(feed(record(1, 0, 1)), kNothing);
  EXPECT_EQ(feed(record(2, 1, 5)), record(2, 0, 6));
}

TEST_F(DeadReckoning, RecordWithoutItemsAddsNothing) {
  EXPECT_EQ(feed(record(1, 0, 0)), kNothing);
  setN(1);
  EXPECT_EQ(feed(record(2, 0, 1)), kNothing);
  EXPECT_EQ(feed(record(3, 0, 0)), kNothing);
  EXPECT_EQ(feed(record(4, 1, 1)), record(4, 0, 2));
}

TEST_F(DeadReckoning, BytesBehindTheItemsAreNotLookedAt) {
  Bytes longer = record(1, 0, 1);
  longer.resize(3000, 0xEE);
  EXPECT_EQ(feed(longer), record(1, 0, 1));
}

TEST_F(DeadReckoning, NewOptionAppliesToWhatIsPending) {
  setN(6);
  for (int i = 0; i < 5; ++i) EXPECT_EQ(feed(record(1, i, 1)), kNothing);
  setN(3);
  EXPECT_EQ(session.buildProc(), 0);
  EXPECT_EQ(feed(record(2, 5, 1)), kNothing);
  setN(0);
  EXPECT_EQ(feed(record(3, 0, 0)), record(3, 0, 6));
}

TEST_F(DeadReckoning, DeliversFromTheSamePlaceEachTime) {
  Bytes first = record(1, 0, 2);
  Bytes second = record(2, 7, 1);
  const Delivery one(session, first);
  const Delivery two(session, second);
  EXPECT_NE(one.out, first.data());
  EXPECT_EQ(one.out, two.out);
  EXPECT_EQ(two.bytes(), record(2, 7, 1));
}

TEST_F(DeadReckoning, RefusesBadRecordsAndStaysAsItWas) {
  setN(6);
  ASSERT_EQ(feed(record(1, 0, 60)), kNothing);

  const Bytes whole = record(2, 60, 4);
  for (size_t len = 0; len < whole.size(); ++len) {
    Bytes part = cut(whole, len);
    EXPECT_EQ(Delivery(session, part).result, -1) << len;
  }
  for (const int count : {-1, -60, -32768}) {
    Bytes negative = joined(bytesOf(uint64_t{3}, static_cast<int16_t>(count)), items(0, 64));
    EXPECT_EQ(Delivery(session, negative).result, -1) << count;
  }
  for (const int count : {5, 64, 32767}) {
    Bytes overflowing = record(4, 0, count);
    EXPECT_EQ(Delivery(session, overflowing).result, -1) << count;
  }

  EXPECT_EQ(feed(whole), record(2, 0, 64));
}

TEST_F(DeadReckoning, RefusesMoreThanSixtyFourItemsAtOnce) {
  Bytes tooMany = record(1, 0, 65);
  EXPECT_EQ(Delivery(session, tooMany).result, -1);
  EXPECT_EQ(feed(record(2, 3, 1)), record(2, 3, 1));
}

TEST_F(DeadReckoning, SessionsGatherApart) {
  SessionPDR other;
  ASSERT_EQ(other.parseOption(R"({"N":1})"), 0);
  setN(1);
  EXPECT_EQ(feed(record(1, 0, 1)), kNothing);
  Bytes data = record(2, 9, 1);
  EXPECT_EQ(Delivery(other, data).result, 0);
  EXPECT_EQ(feed(record(3, 1, 1)), record(3, 0, 2));
}

}  // namespace
}  // namespace senseloom
