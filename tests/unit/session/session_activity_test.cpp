#include "session/session_activity.h"

#include <gtest/gtest.h>

#include <string>

#include "allocations.h"
#include "delivery.h"
#include "fake_registry.h"
#include "option_text.h"

namespace senseloom {
namespace {

using Items = std::vector<uint16_t>;

const std::optional<Bytes> kNothing;

TEST(ActivityCallbacks, EqualityIsOfClassIds) {
  struct {
    uint16_t a;
    uint16_t b;
    bool equal;
  } const cases[] = {{0x0051, 0x0051, true},  {0x0051, 0xFFF1, true}, {0x0051, 0x0052, false},
                     {0x000F, 0x0007, false}, {0x0000, 0x8000, true}, {0x0008, 0x0000, false}};
  for (const auto& [a, b, equal] : cases) EXPECT_EQ(_activity_equal_func(&a, &b), equal) << a << ' ' << b;
  EXPECT_TRUE(_activity_equal_func(nullptr, nullptr));
  EXPECT_FALSE(_activity_equal_func(&cases[0].a, nullptr));
  EXPECT_FALSE(_activity_equal_func(nullptr, &cases[0].a));
}

TEST(ActivityCallbacks, MaskClearsClassesWhoseBitIsNotSet) {
  for (const int mask : {0, 1, 0x06, 0xFF, 0x8000, 0x7FFF, -1}) {
    for (uint16_t id = 0; id < 16; ++id) {
      auto item = static_cast<uint16_t>(0xABC0 | id);
      _activity_mask_func(&item, mask);
      EXPECT_EQ(item, (mask >> id & 1) != 0 ? 0xABC0 | id : 0xABC0) << mask << ' ' << id;
    }
  }
  _activity_mask_func(nullptr, 0);
}

TEST(ActivityCallbacks, SequenceNumberIsSigned) {
  struct {
    uint16_t item;
    int sequence;
  } const cases[] = {{0x0051, 5}, {0x000F, 0}, {0x7FF3, 2047}, {0x8000, -2048}, {0xFFFF, -1}};
  for (const auto& [item, sequence] : cases) EXPECT_EQ(_activity_check_seq_func(&item), sequence) << item;
  EXPECT_EQ(_activity_check_seq_func(nullptr), -1);
}

// A record, and a result.
Bytes record(uint64_t timestamp, const Items& items) {
  return joined(bytesOf(timestamp, static_cast<int16_t>(items.size())), items);
}
// A record that tells of a number of items other than its own.
Bytes recordTelling(int count, const Items& items) {
  return joined(bytesOf(uint64_t{0xBAD}, static_cast<int16_t>(count)), items);
}

class Activity : public testing::Test {
 protected:
  void SetUp() override { fake::registry() = {.name = "PHYAC", .sensor = &sensor}; }
  void TearDown() override { fake::registry() = {}; }

  // Merges the session's option with that of another session, and with its own alone without one.
  void merge(const char* others = nullptr) {
    sensor.mergedOption = session.ownOption().clone();
    if (others == nullptr) return;
    OptionActivity other;
    ASSERT_EQ(other.parse(others), 0);
    sensor.mergedOption->merge(other);
  }
  void negotiate(const std::string& option, const char* others = nullptr) {
    ASSERT_EQ(session.parseOption(option.c_str()), 0);
    merge(others);
    ASSERT_EQ(session.buildProc(), 0);
  }

  // What is delivered for a record that is not refused.
  std::optional<Bytes> feed(Bytes data) {
    const Delivery delivery(session, data);
    EXPECT_NE(delivery.result, -1);
    return delivery.bytes();
  }
  std::optional<Bytes> feed(uint64_t timestamp, const Items& items) { return feed(record(timestamp, items)); }
  // ... for a record of no bytes.
  std::optional<Bytes> feedNoBytes() {
    Bytes data(1);
    const Delivery delivery(session, data, 0);
    EXPECT_NE(delivery.result, -1);
    return delivery.bytes();
  }
  void expectRefused(Bytes data) { EXPECT_EQ(Delivery(session, data).result, -1) << testing::PrintToString(data); }

  fake::Sensor sensor;
  SessionActivity session;
};

TEST_F(Activity, HasItsSensorsName) {
  EXPECT_STREQ(session.name, "PHYAC");
}

TEST_F(Activity, ParsesItsOptionAndRefusesWhatCanNotBeRead) {
  EXPECT_EQ(session.parseOption(R"({"logN":3})"), 0);
  EXPECT_EQ(session.parseOption("no JSON"), -1);
  EXPECT_EQ(session.parseOption(nullptr), -1);
  EXPECT_EQ(static_cast<const OptionActivity&>(session.ownOption()).logN(), 3);
}

TEST_F(Activity, PassesRecordsThroughBeforeTheFirstNegotiation) {
  ASSERT_EQ(session.parseOption(R"({"logN":3})"), 0);
  for (const int len : {0, 1, 9, 10, 12, 600}) {
    Bytes data(600, 0xFF);
    const Delivery delivery(session, data, len);
    EXPECT_EQ(delivery.result, 1);
    EXPECT_EQ(delivery.out, data.data());
    EXPECT_EQ(delivery.outLen, len);
    EXPECT_EQ(data, Bytes(600, 0xFF));
  }
}

TEST_F(Activity, RefusesBadArgumentsWithAndWithoutAChain) {
  for (const bool withChain : {false, true}) {
    if (withChain) negotiate("{}");
    Bytes data = record(1, {0x51});
    void* out = &data;
    int outLen = -77;
    EXPECT_EQ(session.postProcess(data.data(), 12, nullptr, &outLen), -1);
    EXPECT_EQ(session.postProcess(nullptr, 12, &out, &outLen), -1);
    EXPECT_EQ(session.postProcess(data.data(), 12, &out, nullptr), -1);
    EXPECT_EQ(session.postProcess(data.data(), -1, &out, &outLen), -1);
    EXPECT_EQ(out, &data);
    EXPECT_EQ(outLen, -77);
  }
}

TEST_F(Activity, ByDefaultReportsTheFirstItemOfEachRecord) {
  negotiate("{}");
  EXPECT_EQ(feed(1, {0x0051}), record(1, {0x0051}));
  EXPECT_EQ(feed(2, {0x8023, 0x0031, 0x0044}), record(2, {0x8023}));
  EXPECT_EQ(feed(3, {0xFFF7}), record(3, {0xFFF7}));
  for (uint16_t id = 8; id < 16; ++id) {
    EXPECT_EQ(feed(4, {static_cast<uint16_t>(0x0120 | id)}), record(4, {0x0120})) << id;
  }
  EXPECT_EQ(feed(5, {}), kNothing);
  EXPECT_EQ(feed(6, {0x0051}), record(6, {0x0051})) << "a steady class is reported each time";
}

TEST_F(Activity, VotesFourRecordsDownToOneItem) {
  negotiate(R"({"logN":2,"weightVar":1})");
  EXPECT_EQ(feed(1, {0x0051}), kNothing);
  EXPECT_EQ(feed(2, {0x0061}), kNothing);
  EXPECT_EQ(feed(3, {0x0072}), kNothing);
  const auto result = feed(0xF122334455667788, {0x0082});
  EXPECT_EQ(result, record(0xF122334455667788, {0x0052}));
  EXPECT_EQ(result->size(), 12U);
  EXPECT_EQ(feed(5, {0x0051}), kNothing) << "the next batch starts empty";
}

TEST_F(Activity, VoteWithoutMajorityIsClassSix) {
  negotiate(R"({"logN":2})");
  EXPECT_EQ(feed(1, {0x0051, 0x0061, 0x0072, 0x0083}), record(1, {0x0056}));
}

TEST_F(Activity, OneRecordCanCompleteABatchAndItsOtherItemsAreDropped) {
  negotiate(R"({"logN":2,"summary":0})");
  EXPECT_EQ(feed(1, {0x11, 0x22, 0x33, 0x44}), record(1, {0x11, 0x22, 0x33, 0x44}));
  EXPECT_EQ(feed(2, {0x51, 0x62, 0x73, 0x84, 0x95, 0xA6}), record(2, {0x51, 0x62, 0x73, 0x84}));
  EXPECT_EQ(feed(3, {0xB1, 0xC2, 0xD3}), kNothing);
  EXPECT_EQ(feed(4, {0xE4, 0xF5}), record(4, {0xB1, 0xC2, 0xD3, 0xE4}));
}

TEST_F(Activity, GathersTwoToTheSpanBetweenItsLogNAndTheSmallestLogM) {
  for (int logN = 0; logN <= 8; ++logN) {
    for (int logM = 0; logM <= logN; ++logM) {
      // The other session's logN is merged, too, and changes nothing.
      const std::string others = optionText({{"logN", logM}, {"logM", logM}});
      negotiate(optionText({{"logN", logN}, {"logM", 8}}), others.c_str());
      for (int batch = 0; batch < 2; ++batch) {
        int records = 1;
        while (records <= 256 && !feed(1, {0x0051})) ++records;
        EXPECT_EQ(records, 1 << (logN - logM)) << logN << ' ' << logM;
      }
    }
  }
}

TEST_F(Activity, FollowsItsOwnOptionInAllButLogM) {
  negotiate(R"({"mode":0,"logN":1,"classMask":2,"summary":1})",
            R"({"mode":1,"logN":1,"classMask":4,"summary":0,"weightVar":0})");
  EXPECT_EQ(feed(1, {0x0012, 0x0022}), record(1, {0x0010}));
  EXPECT_EQ(feed(2, {0x0012, 0x0022}), record(2, {0x0010}));
  EXPECT_EQ(feed(3, {0x0011, 0x0021}), record(3, {0x0011}));
  EXPECT_EQ(feed(4, {0x0011, 0x0022}), record(4, {0x0010})) << "class 6 of equal weights, masked";
}

TEST_F(Activity, WithoutSummaryMasksEachItem) {
  negotiate(R"({"logN":2,"summary":0,"classMask":6})");
  EXPECT_EQ(feed(1, {0x8011, 0x0022, 0xFFF3, 0x004F}), record(1, {0x8011, 0x0022, 0xFFF0, 0x0040}));
}

TEST_F(Activity, WithoutSummaryAndMaskKeepsEveryClass) {
  negotiate(R"({"logN":4,"summary":0})");
  Items all;
  for (uint16_t id = 0; id < 16; ++id) all.push_back(static_cast<uint16_t>(id * 16 + id));
  EXPECT_EQ(feed(1, all), record(1, all));
}

TEST_F(Activity, CountsUnmaskedClassesAndMasksTheWinner) {
  negotiate(R"({"logN":2,"classMask":2})");
  EXPECT_EQ(feed(1, {0x0011, 0x0023, 0x0033, 0x0043}), record(1, {0x0010}));
  EXPECT_EQ(feed(2, {0x0051, 0x0061, 0x0071, 0x0083}), record(2, {0x0051}));
  EXPECT_EQ(feed(3, {0x0051, 0x0061, 0x0073, 0x0083}), record(3, {0x0050})) << "no majority is class 6, masked";
}

TEST_F(Activity, ModeOneReportsASteadyClassOnce) {
  negotiate(R"({"mode":1})");
  EXPECT_EQ(feed(1, {0x0011}), record(1, {0x0011}));
  EXPECT_EQ(feed(2, {0x0021}), kNothing);
  EXPECT_EQ(feed(3, {0x0031}), kNothing);
  EXPECT_EQ(feed(4, {0x0042}), record(4, {0x0042}));
  EXPECT_EQ(feed(5, {0x0052}), kNothing);
  EXPECT_EQ(feed(6, {0x0061}), record(6, {0x0061}));
}

TEST_F(Activity, ModeOneComparesVotedClasses) {
  negotiate(R"({"mode":1,"logN":2})");
  EXPECT_EQ(feed(1, {0x0011, 0x0021, 0x0031, 0x0042}), record(1, {0x0011}));
  EXPECT_EQ(feed(2, {0x0052, 0x0061, 0x0071, 0x0081}), kNothing);
  EXPECT_EQ(feed(3, {0x0092, 0x00A2, 0x00B2, 0x00C1}), record(3, {0x0092}));
}

TEST_F(Activity, ModeOneIgnoresChangesAmongMaskedClasses) {
  negotiate(R"({"mode":1,"classMask":2})");
  EXPECT_EQ(feed(1, {0x0013}), record(1, {0x0010}));
  EXPECT_EQ(feed(2, {0x0024}), kNothing);
  EXPECT_EQ(feed(3, {0x0031}), record(3, {0x0031}));
  EXPECT_EQ(feed(4, {0x0045}), record(4, {0x0040}));
  EXPECT_EQ(feed(5, {0x0050}), kNothing);
}

TEST_F(Activity, ModeOneWithoutSummaryReportsABatchWithAnyChange) {
  negotiate(R"({"mode":1,"logN":1,"summary":0})");
  EXPECT_EQ(feed(1, {0x0011, 0x0021}), record(1, {0x0011, 0x0021}));
  EXPECT_EQ(feed(2, {0x0032, 0x0041}), record(2, {0x0032, 0x0041}));
  EXPECT_EQ(feed(3, {0x0051, 0x0061}), kNothing) << "the last item is remembered";
  EXPECT_EQ(feed(4, {0x0071}), kNothing);
  EXPECT_EQ(feed(5, {0x0082}), record(5, {0x0071, 0x0082}));
}

TEST_F(Activity, OnlyModeOneReportsOnChange) {
  for (const int mode : {0, 2, -1, 3}) {
    negotiate(optionText({{"mode", mode}}));
    EXPECT_EQ(feed(1, {0x0011}), record(1, {0x0011})) << mode;
    EXPECT_EQ(feed(2, {0x0021}), record(2, {0x0021})) << mode;
  }
}

TEST_F(Activity, NegativeCountLeavesTheBatchAsItWas) {
  negotiate(R"({"logN":1,"summary":0})");
  EXPECT_EQ(feed(1, {0x0011}), kNothing);
  for (const int count : {-1, -32768}) EXPECT_EQ(feed(recordTelling(count, {0x0099, 0x0099})), kNothing);
  EXPECT_EQ(feed(2, {0x0022}), record(2, {0x0011, 0x0022}));
}

TEST_F(Activity, RefusedRecordChangesNothing) {
  negotiate(R"({"logN":2,"summary":0})");
  EXPECT_EQ(feed(7, {0x0011}), kNothing);
  const Bytes whole = recordTelling(3, {0x0099, 0x0099, 0x0099});
  for (size_t len = 1; len < whole.size(); ++len) expectRefused(cut(whole, len));
  expectRefused(recordTelling(257, Items(256)));
  expectRefused(recordTelling(32767, Items(256)));
  EXPECT_EQ(feedNoBytes(), kNothing) << "the record kept is still the one before, with one item";
  EXPECT_EQ(feed(8, {0x0022, 0x0033}), record(8, {0x0011, 0x0011, 0x0022, 0x0033}));
}

TEST_F(Activity, BytesBehindTheItemsAreNotLookedAt) {
  negotiate(R"({"logN":1,"summary":0})");
  Bytes longer = record(1, {0x0011});
  longer.resize(1000, 0xEE);
  EXPECT_EQ(feed(longer), kNothing);
  EXPECT_EQ(feed(2, {0x0022}), record(2, {0x0011, 0x0022}));
}

TEST_F(Activity, LargestBatchFitsAndMoreItemsAreDropped) {
  negotiate(R"({"logN":8,"summary":0})");
  Items items(300);
  for (size_t i = 0; i < items.size(); ++i) items[i] = static_cast<uint16_t>(i * 37);
  const Items first(items.begin(), items.begin() + 256);
  EXPECT_EQ(feed(1, first), record(1, first));
  EXPECT_EQ(feed(2, items), record(2, first));
  items.resize(32767);
  EXPECT_EQ(feed(3, items), record(3, first));
}

TEST_F(Activity, ItemsOfALongRecordFillTheRestOfABatch) {
  negotiate(R"({"logN":8,"summary":0})");
  Items batch(256, 0x0013);
  batch[0] = 0x0021;
  EXPECT_EQ(feed(1, {0x0021}), kNothing);
  EXPECT_EQ(feed(2, Items(300, 0x0013)), record(2, batch));
}

TEST_F(Activity, NoBytesStandForTheRecordBefore) {
  negotiate(R"({"logN":1,"summary":0,"classMask":2})");
  EXPECT_EQ(feedNoBytes(), kNothing) << "at first there is none";
  EXPECT_EQ(feed(7, {0x0013}), kNothing);
  EXPECT_EQ(feedNoBytes(), record(7, {0x0010, 0x0010}));
  EXPECT_EQ(feed(8, {0x0021}), kNothing);
  EXPECT_EQ(feed(9, {0x0033, 0x0041, 0x0051}), record(9, {0x0021, 0x0030}));
  EXPECT_EQ(feedNoBytes(), record(9, {0x0021, 0x0030})) << "and then the result before";
}

TEST_F(Activity, NoBytesCanStandForARecordWithTooManyItems) {
  negotiate(R"({"mode":1,"logN":8,"summary":0})");
  const Items batch(256, 0x0013);
  EXPECT_EQ(feed(1, Items(300, 0x0013)), record(1, batch));
  EXPECT_EQ(feed(2, Items(300, 0x0023)), kNothing);
  EXPECT_EQ(feedNoBytes(), kNothing);
  EXPECT_EQ(feed(3, Items(300, 0x0014)), record(3, Items(256, 0x0014)));
}

TEST_F(Activity, DeliversFromTheSamePlaceEachTime) {
  negotiate("{}");
  Bytes first = record(1, {0x0011});
  Bytes second = record(2, {0x0022});
  const Delivery one(session, first);
  const Delivery two(session, second);
  EXPECT_NE(one.out, first.data());
  EXPECT_EQ(one.out, two.out);
  EXPECT_EQ(one.bytes(), record(2, {0x0022})) << "overwritten";
}

TEST_F(Activity, DoesNotChangeTheClientsRecord) {
  negotiate(R"({"classMask":0,"summary":0})");
  Bytes data = record(1, {0x0011});
  EXPECT_EQ(Delivery(session, data).bytes(), record(1, {0x0010}));
  EXPECT_EQ(data, record(1, {0x0011}));
}

TEST_F(Activity, NewOptionTakesEffectWhenTheChainIsBuilt) {
  negotiate(R"({"summary":0})");
  ASSERT_EQ(session.parseOption(R"({"summary":0,"logN":1,"classMask":0})"), 0);
  EXPECT_EQ(feed(1, {0x0011}), record(1, {0x0011}));
  merge();
  ASSERT_EQ(session.buildProc(), 0);
  EXPECT_EQ(feed(2, {0x0011}), kNothing);
  EXPECT_EQ(feed(3, {0x0022}), record(3, {0x0010, 0x0020}));
}

TEST_F(Activity, BuildingAnewDropsThePartialBatch) {
  negotiate(R"({"logN":1,"summary":0})");
  EXPECT_EQ(feed(1, {0x0011}), kNothing);
  ASSERT_EQ(session.buildProc(), 0);
  EXPECT_EQ(feed(2, {0x0022}), kNothing);
  EXPECT_EQ(feed(3, {0x0033}), record(3, {0x0022, 0x0033}));
}

TEST_F(Activity, BuildingAnewForgetsTheClassReportedLast) {
  negotiate(R"({"mode":1})");
  EXPECT_EQ(feed(1, {0x0011}), record(1, {0x0011}));
  EXPECT_EQ(feed(2, {0x0021}), kNothing);
  ASSERT_EQ(session.buildProc(), 0);
  EXPECT_EQ(feed(3, {0x0031}), record(3, {0x0031}));
}

TEST_F(Activity, CanNotBuildWithoutItsSensorAndKeepsItsChain) {
  fake::registry().name = "PHYAD";
  EXPECT_EQ(session.buildProc(), -1);
  EXPECT_EQ(feed(1, {0x0011, 0x0022}), record(1, {0x0011, 0x0022})) << "still passed through";

  fake::registry().name = "PHYAC";
  negotiate(R"({"logN":1,"summary":0})");
  EXPECT_EQ(feed(2, {0x0011}), kNothing);
  fake::registry().name = "PHYAD";
  EXPECT_EQ(session.buildProc(), -1);
  EXPECT_EQ(feed(3, {0x0022}), record(3, {0x0011, 0x0022}));
}

TEST_F(Activity, CanNotBuildBeforeTheFirstMergeAndKeepsItsChain) {
  EXPECT_EQ(session.buildProc(), -1);
  EXPECT_EQ(feed(1, {0x0011, 0x0022}), record(1, {0x0011, 0x0022}));
}

TEST_F(Activity, ChainThatStaysAsItIsStartsOverWithoutMemory) {
  negotiate(R"({"logN":1,"summary":0})");
  EXPECT_EQ(feed(1, {0x0011}), kNothing);
  {
    const fake::FailingAllocation first(1);
    EXPECT_EQ(session.buildProc(), 0);
    EXPECT_FALSE(first.happened());
  }
  EXPECT_EQ(feed(2, {0x0022}), kNothing);
  EXPECT_EQ(feed(3, {0x0033}), record(3, {0x0022, 0x0033}));
}

TEST_F(Activity, KeepsItsChainWhenMemoryRunsOut) {
  negotiate(R"({"logN":1,"summary":0})");
  EXPECT_EQ(feed(1, {0x0011}), kNothing);
  ASSERT_EQ(session.parseOption(R"({"mode":1,"logN":2})"), 0);
  merge();
  size_t failures = 0;
  for (;; ++failures) {
    const fake::FailingAllocation next(failures + 1);
    const int result = session.buildProc();
    if (!next.happened()) {
      EXPECT_EQ(result, 0);
      break;
    }
    EXPECT_EQ(result, -1);
    EXPECT_EQ(feed(2, {0x0022}), record(2, {0x0011, 0x0022})) << failures;
    EXPECT_EQ(feed(3, {0x0011}), kNothing);
  }
  EXPECT_GE(failures, 4U) << "the four stages at least are allocated";
  EXPECT_EQ(feed(4, {0x0011, 0x0021, 0x0031}), kNothing);
  EXPECT_EQ(feed(5, {0x0041}), record(5, {0x0011}));
}

}  // namespace
}  // namespace senseloom
