#include "client.h"

// Physical activity, end to end. Items are written as 0xSSSC: sequence number, class.
namespace api {
namespace {

using Items = std::vector<uint16_t>;

class Activity : public ::testing::Test {
 protected:
  // A new session with that option.
  static void* open(const std::string& option) {
    void* const handle = ctx_open_session("PHYAC");
    EXPECT_EQ(setOption(handle, option).result, 0);
    return handle;
  }

  void* const client_ = ctx_open_session("PHYAC");
};

// The value of property 43: the largest span and the smallest.
constexpr int32_t spans(int32_t largest, int32_t smallest) {
  return largest << 16 | smallest;
}

TEST_F(Activity, PassesEverythingThroughUntilTheSensorsFirstNegotiation) {
  for (const Bytes& any :
       {Bytes{}, Bytes{1}, activity(1, {0x0019, 0x0023}), record(2, int16_t{-1}), Bytes(600, 0xFF)}) {
    EXPECT_EQ(dispatch(client_, any), handedBack(any));
  }
  open("{}");  // somebody else's, but all sessions of the sensor start over
  EXPECT_EQ(dispatch(client_, activity(1, {0x0012, 0x0023})), made(activity(1, {0x0012})));
}

TEST_F(Activity, FailedOptionLeavesASessionWithoutAChain) {
  EXPECT_EQ(setOption(client_, "{"), kFailed);
  EXPECT_EQ(dispatch(client_, {7}), handedBack({7}));
}

TEST_F(Activity, DefaultsDeliverTheFirstItemOfEveryRecord) {
  EXPECT_EQ(setOption(client_, "{}"), (Negotiated{0, properties({{41, 0}, {43, spans(1, 1)}, {44, 1}, {42, -1}})}));
  EXPECT_EQ(dispatch(client_, activity(1, {0x0011})), made(activity(1, {0x0011})));
  EXPECT_EQ(dispatch(client_, activity(2, {0x0027, 0x0031, 0x0041})), made(activity(2, {0x0027})));
  EXPECT_EQ(dispatch(client_, activity(3, {0xFFF0})), made(activity(3, {0xFFF0})));
  for (uint16_t unknown = 8; unknown < 16; ++unknown) {
    EXPECT_EQ(dispatch(client_, activity(4, {static_cast<uint16_t>(0x8000 | unknown)})), made(activity(4, {0x8000})));
  }
}

TEST_F(Activity, VotesABatchGatheredFromSeveralRecords) {
  setOption(client_, R"({"logN": 2, "weightVar": 1})");
  // Weights 1024, 1536, 2304, 3456: class 2 has 5760 of 8320.
  EXPECT_EQ(dispatch(client_, activity(0x0101, {0x0051})), kNothing);
  EXPECT_EQ(dispatch(client_, activity(0x0102, {0x0061})), kNothing);
  EXPECT_EQ(dispatch(client_, activity(0x0103, {0x0072})), kNothing);
  EXPECT_EQ(dispatch(client_, activity(0x8877665544332211, {0x0082})),
            made({0x11, 0x22, 0x33, 0x44, 0x55, 0x66, 0x77, 0x88, 1, 0, 0x52, 0x00}));
  EXPECT_EQ(dispatch(client_, activity(0x0105, {0x0091})), kNothing);
}

TEST_F(Activity, VotesByStrictMajorityOfTheWeights) {
  const struct {
    const char* option;
    Items items;
    uint16_t voted;
  } batches[] = {
      {R"({"logN": 2})", {0x0051, 0x0061, 0x0072, 0x0083}, 0x0056},  // 2048 of 4096: no majority is class 6
      {R"({"logN": 2})", {0x0051, 0x0061, 0x0071, 0x0083}, 0x0051},
      {R"({"logN": 2})", {0xFFF9, 0x0069, 0x007F, 0x0080}, 0xFFF0},                  // unknown classes count as class 0
      {R"({"logN": 2, "weightVar": 1})", {0x0052, 0x0061, 0x0071, 0x0083}, 0x0056},  // 3840 of 8320
      {R"({"logN": 1, "weightVar": 1})", {0x0052, 0x0063}, 0x0053},                  // 1536 of 2560
      {R"({"logN": 1, "weightVar": 0})", {0x0052, 0x0063}, 0x0053},                  // 2048 of 3072
      {R"({"logN": 1, "weightVar": 11})", {0x0052, 0x0063}, 0x0056},                 // 1024 of 2048
      {R"({"logN": 1, "weightVar": 10})", {0x0052, 0x0063}, 0x0053},                 // 1025 of 2049
      {R"({"logN": 1, "weightVar": 32})", {0x0052, 0x0063}, 0x0053},                 // as 0
      {R"({"logN": 1, "weightVar": -5})", {0x0052, 0x0063}, 0x0056},                 // as -1
  };
  for (const auto& [option, items, voted] : batches) {
    setOption(client_, option);
    EXPECT_EQ(dispatch(client_, activity(1, items)), made(activity(1, {voted}))) << option;
  }
}

TEST_F(Activity, VoteWrapsAroundInLongBatchesOfDoublingWeights) {
  setOption(client_, R"({"logN": 5, "weightVar": 0})");
  // The weights are 2^10 to 2^30, then -2^31, then 0. All together are -1024, and so is the score of class 1: less than
  // the 0 of class 0, which is above the half of -512.
  Items items(32, 0x0011);
  EXPECT_EQ(dispatch(client_, activity(1, items)), made(activity(1, {0x0010})));
  items[21] = 0x0012;  // leaves class 1 with 2^31 - 1024
  EXPECT_EQ(dispatch(client_, activity(2, items)), made(activity(2, {0x0011})));
}

TEST_F(Activity, DropsTheItemsOfARecordBeyondItsBatch) {
  setOption(client_, R"({"logN": 2, "summary": 0})");
  EXPECT_EQ(dispatch(client_, activity(1, {0x0011, 0x0022, 0x0033})), kNothing);
  EXPECT_EQ(dispatch(client_, activity(2, {0x0044, 0x0055, 0x0066})),
            made(activity(2, {0x0011, 0x0022, 0x0033, 0x0044})));
  EXPECT_EQ(dispatch(client_, activity(3, {0x0071, 0x0082, 0x0093, 0x00A4, 0x00B5})),
            made(activity(3, {0x0071, 0x0082, 0x0093, 0x00A4})));
}

TEST_F(Activity, DeliversTheLargestBatchWhole) {
  setOption(client_, R"({"logN": 8, "summary": 0, "classMask": 254})");
  Items items(300);
  for (size_t i = 0; i < items.size(); ++i) items[i] = static_cast<uint16_t>(i << 4 | i % 8);
  const Items batch(items.begin(), items.begin() + 256);  // class 0 is masked, and stays class 0
  EXPECT_EQ(dispatch(client_, activity(1, items)), made(activity(1, batch)));
  EXPECT_EQ(dispatch(client_, activity(2, Items(items.begin(), items.begin() + 255))), kNothing);
  const Delivery last = dispatch(client_, activity(3, {0x1237}));
  EXPECT_EQ(last.record.size(), 522U);
  EXPECT_EQ(Bytes(last.record.end() - 2, last.record.end()), (Bytes{0x37, 0x12}));
}

TEST_F(Activity, NegativeOrNoCountLeavesTheBatchAsItWas) {
  setOption(client_, R"({"logN": 1, "summary": 0})");
  EXPECT_EQ(dispatch(client_, activity(1, {0x0011})), kNothing);
  EXPECT_EQ(dispatch(client_, record(2, int16_t{-1}, uint16_t{0x0022})), kNothing);
  EXPECT_EQ(dispatch(client_, record(3, int16_t{INT16_MIN}, uint16_t{0x0032})), kNothing);
  EXPECT_EQ(dispatch(client_, record(3, int16_t{-3})), kNothing);
  EXPECT_EQ(dispatch(client_, record(4, int16_t{0}, uint16_t{0x0042})), kNothing);
  EXPECT_EQ(dispatch(client_, activity(5, {0x0053})), made(activity(5, {0x0011, 0x0053})));
}

TEST_F(Activity, RefusesARecordThatDoesNotHoldItsItemsAndChangesNothing) {
  setOption(client_, R"({"logN": 1, "summary": 0})");
  EXPECT_EQ(dispatch(client_, activity(1, {0x0011})), kNothing);
  for (size_t length = 1; length < 10; ++length) EXPECT_EQ(dispatch(client_, Bytes(length)), kRefused) << length;
  EXPECT_EQ(dispatch(client_, record(2, int16_t{1})), kRefused);
  EXPECT_EQ(dispatch(client_, record(3, int16_t{1}, uint8_t{0x22})), kRefused);
  EXPECT_EQ(dispatch(client_, record(4, int16_t{2}, uint16_t{0x0022}, uint8_t{0})), kRefused);
  EXPECT_EQ(dispatch(client_, record(5, int16_t{INT16_MAX}, uint16_t{0x0022})), kRefused);
  EXPECT_EQ(dispatch(client_, {}), made(activity(1, {0x0011, 0x0011})));  // what the session holds is still record 1
}

TEST_F(Activity, RecordOfNoBytesStandsForWhatTheSessionHolds) {
  setOption(client_, R"({"logN": 2, "summary": 0, "classMask": 6})");
  EXPECT_EQ(dispatch(client_, {}), kNothing);  // nothing yet: a count of 0
  EXPECT_EQ(dispatch(client_, activity(1, {0x0011, 0x0022})), kNothing);
  EXPECT_EQ(dispatch(client_, {}), made(activity(1, {0x0011, 0x0022, 0x0011, 0x0022})));
  // Now it holds that result.
  EXPECT_EQ(dispatch(client_, {}), made(activity(1, {0x0011, 0x0022, 0x0011, 0x0022})));
  EXPECT_EQ(dispatch(client_, record(2, int16_t{-1})), kNothing);
  EXPECT_EQ(dispatch(client_, {}), kNothing);
}

TEST_F(Activity, TakesARecordLongerThanItsItems) {
  setOption(client_, R"({"summary": 0})");
  Bytes longer = activity(1, {0x0011});
  longer.resize(5000, 0xEE);
  EXPECT_EQ(dispatch(client_, longer), made(activity(1, {0x0011})));
}

TEST_F(Activity, MaskTurnsUnwantedClassesIntoClass0) {
  setOption(client_, R"({"logN": 2, "summary": 0, "classMask": 6})");
  EXPECT_EQ(dispatch(client_, activity(1, {0x1231, 0x4562, 0x7893, 0xFFFF})),
            made(activity(1, {0x1231, 0x4562, 0x7890, 0xFFF0})));
  // The vote comes first and counts unmasked classes: class 3 wins, and then is unwanted.
  setOption(client_, R"({"logN": 2, "classMask": 6})");
  EXPECT_EQ(dispatch(client_, activity(2, {0x0011, 0x0023, 0x0033, 0x0043})), made(activity(2, {0x0010})));
  setOption(client_, R"({"logN": 2, "classMask": 64})");
  EXPECT_EQ(dispatch(client_, activity(3, {0x0011, 0x0022, 0x0033, 0x0044})), made(activity(3, {0x0016})));
}

TEST_F(Activity, Mode1DeliversChangesOfTheMaskedClassAlone) {
  setOption(client_, R"({"mode": 1, "logN": 1, "classMask": 6})");
  const struct {
    Items items;
    bool delivered;
    uint16_t voted;
  } batches[] = {
      {{0x0011, 0x0021}, true, 0x0011},  // the first one
      {{0x0031, 0x0041}, false, 0},     {{0x0052, 0x0062}, true, 0x0052},
      {{0x0073, 0x0083}, true, 0x0070},  // class 3 is masked
      {{0x0094, 0x00A4}, false, 0},      // as is class 4: no change
      {{0x00B1, 0x00C2}, false, 0},      // no majority: class 6, masked
      {{0x00D2, 0x00E2}, true, 0x00D2},
  };
  uint64_t timestamp = 0;
  for (const auto& [items, delivered, voted] : batches) {
    ++timestamp;
    EXPECT_EQ(dispatch(client_, activity(timestamp, items)), delivered ? made(activity(timestamp, {voted})) : kNothing);
  }
}

TEST_F(Activity, Mode1ComparesEveryItemWithTheLastOneDelivered) {
  setOption(client_, R"({"mode": 1, "logN": 1, "summary": 0})");
  EXPECT_EQ(dispatch(client_, activity(1, {0x0011, 0x0021})), made(activity(1, {0x0011, 0x0021})));
  EXPECT_EQ(dispatch(client_, activity(2, {0x0032, 0x0041})), made(activity(2, {0x0032, 0x0041})));
  EXPECT_EQ(dispatch(client_, activity(3, {0x0051, 0x0061})), kNothing);  // 1 stayed the remembered class
  EXPECT_EQ(dispatch(client_, activity(4, {0x0071, 0x0082})), made(activity(4, {0x0071, 0x0082})));
  EXPECT_EQ(dispatch(client_, activity(5, {0x0091, 0x00A1})), made(activity(5, {0x0091, 0x00A1})));
}

TEST_F(Activity, OnlyMode1SuppressesRepetition) {
  for (const char* option : {R"({"mode": 0})", R"({"mode": 2})", R"({"mode": -1})", R"({"continuous": 1})"}) {
    setOption(client_, option);
    EXPECT_EQ(dispatch(client_, activity(1, {0x0011})), made(activity(1, {0x0011}))) << option;
    EXPECT_EQ(dispatch(client_, activity(2, {0x0021})), made(activity(2, {0x0021}))) << option;
  }
}

TEST_F(Activity, EveryNegotiationOfTheSensorStartsTheSessionOver) {
  setOption(client_, R"({"logN": 1, "mode": 1})");
  EXPECT_EQ(dispatch(client_, activity(1, {0x0011, 0x0021})), made(activity(1, {0x0011})));

  EXPECT_EQ(dispatch(client_, activity(2, {0x0031})), kNothing);
  void* const other = ctx_open_session("PHYAC");  // no negotiation yet: class 1 and half a batch are remembered
  EXPECT_EQ(setOption(client_, "no JSON"), kFailed);
  EXPECT_EQ(dispatch(client_, activity(3, {0x0041})), kNothing);

  EXPECT_EQ(dispatch(client_, activity(4, {0x0051})), kNothing);
  setOption(other, "{}");
  EXPECT_EQ(dispatch(client_, activity(5, {0x0061})), kNothing);
  EXPECT_EQ(dispatch(client_, activity(6, {0x0071})), made(activity(6, {0x0061})));

  EXPECT_EQ(dispatch(client_, activity(7, {0x0081})), kNothing);
  closeSession(other);
  EXPECT_EQ(dispatch(client_, activity(8, {0x0091})), kNothing);
  EXPECT_EQ(dispatch(client_, activity(9, {0x00A1})), made(activity(9, {0x0091})));
}

TEST_F(Activity, BatchSizeIsTheSessionsSpanInStepsOfTheSensorsSmallest) {
  const auto batchSize = [](void* handle) {
    for (int size = 1;; ++size) {
      if (dispatch(handle, activity(1, {0x0011})).result == 1) return size;
    }
  };
  EXPECT_EQ(setOption(client_, R"({"logN": 3, "logM": 1})"),
            (Negotiated{0, properties({{41, 0}, {43, spans(8, 8)}, {44, 4}, {42, -1}})}));
  EXPECT_EQ(batchSize(client_), 4);

  void* const other = ctx_open_session("PHYAC");
  EXPECT_EQ(setOption(other, R"({"logN": 1})"),
            (Negotiated{0, properties({{41, 0}, {43, spans(8, 2)}, {44, 2}, {42, -1}})}));
  EXPECT_EQ(batchSize(client_), 8);
  EXPECT_EQ(batchSize(other), 2);

  EXPECT_EQ(setOption(other, R"({"logN": 12, "logM": 2})"),
            (Negotiated{0, properties({{41, 0}, {43, spans(4096, 8)}, {44, 4}, {42, -1}})}));
  EXPECT_EQ(batchSize(client_), 4);
  EXPECT_EQ(batchSize(other), 128);

  EXPECT_EQ(closeSession(client_), (Negotiated{1, properties({{41, 0}, {43, spans(4096, 256)}, {44, 64}, {42, -1}})}));
  EXPECT_EQ(batchSize(other), 64);
}

TEST_F(Activity, SessionVotesByItsOwnOptionWhoeverNegotiatesLast) {
  EXPECT_EQ(setOption(client_, R"({"logN": 1, "weightVar": 1})").result, 0);
  void* const other = open(R"({"logN": 1, "summary": 0, "mode": 1, "classMask": 4})");
  const Bytes pair = activity(1, {0x0052, 0x0063});
  const Bytes again = activity(2, {0x0052, 0x0063});
  EXPECT_EQ(dispatch(client_, pair), made(activity(1, {0x0053})));  // 1536 of 2560
  EXPECT_EQ(dispatch(client_, again), made(activity(2, {0x0053})));
  EXPECT_EQ(dispatch(other, pair), made(activity(1, {0x0052, 0x0060})));
}

TEST_F(Activity, ResultsOfASessionAreInOneBufferOfItsOwn) {
  void* const other = open("{}");
  const auto addressOfResult = [](void* handle, uint16_t item) {
    Bytes bytes = activity(1, {item});
    void* out = nullptr;
    int length = 0;
    EXPECT_EQ(ctx_dispatch_data(handle, bytes.data(), static_cast<int>(bytes.size()), &out, &length), 1);
    return static_cast<const uint8_t*>(out);
  };
  const uint8_t* const first = addressOfResult(client_, 0x0011);
  const uint8_t* const others = addressOfResult(other, 0x0022);
  EXPECT_NE(first, others);
  EXPECT_EQ(first[10], 0x11);
  EXPECT_EQ(addressOfResult(client_, 0x0033), first);
  EXPECT_EQ(first[10], 0x33);
  EXPECT_EQ(others[10], 0x22);
}

// Three clients of one stream: "map" wants the voted class of four on change, "diary" the pairs that bring a change,
// "alarm" joins later, for class 1 alone.
TEST_F(Activity, ServesSeveralClientsOfOneStreamEachInItsOwnWay) {
  void* const map = client_;
  void* const diary = ctx_open_session("PHYAC");
  EXPECT_EQ(setOption(map, R"({"mode": 1, "logN": 2, "weightVar": 1, "classMask": 6})"),
            (Negotiated{0, properties({{41, 0}, {43, spans(4, 1)}, {44, 1}, {42, -1}})}));
  EXPECT_EQ(setOption(diary, R"({"mode": 1, "logN": 1, "summary": 0, "classMask": 255})"),
            (Negotiated{0, properties({{41, 0}, {43, spans(4, 2)}, {44, 2}, {42, 255}})}));
  void* alarm = nullptr;

  const struct {
    uint16_t item;  // its sequence number is its record's timestamp, too
    std::optional<uint16_t> map;
    std::optional<Items> diary;
    std::optional<uint16_t> alarm;
  } stream[] = {
      {0x0011, {}, {}, {}},
      {0x0021, {}, Items{0x0011, 0x0021}, {}},
      {0x0032, {}, {}, {}},
      {0x0041, 0x0011, Items{0x0032, 0x0041}, {}},  // map: class 1 has 6016 of 8320
      {0x0052, {}, {}, {}},
      {0x0062, {}, Items{0x0052, 0x0062}, {}},
      {0x0072, {}, {}, {}},
      {0x0083, 0x0052, Items{0x0072, 0x0083}, {}},  // map: class 2 has 4864
      {0x0093, {}, {}, {}},
      {0x00A3, {}, {}, {}},  // diary: both as the 3 before
      {0x00B3, {}, {}, {}},
      {0x00C3, 0x0090, {}, {}},  // map: class 3, which it does not want
      {0x00D4, {}, {}, {}},
      {0x00E4, {}, Items{0x00D4, 0x00E4}, {}},
      {0x00F5, {}, {}, {}},
      {0x0105, {}, Items{0x00F5, 0x0105}, {}},  // map: class 5 has 5760, not wanted either: no change
      // Here the alarm joins and everybody starts over.
      {0x0115, {}, {}, {}},
      {0x0121, {}, Items{0x0115, 0x0121}, 0x0110},  // alarm: no majority
      {0x0131, {}, {}, {}},
      {0x0141, 0x0111, {}, 0x0131},  // map: class 1 has 7296; diary: both as the 1 before
  };
  for (const auto& [item, toMap, toDiary, toAlarm] : stream) {
    const uint64_t timestamp = item >> 4;
    if (timestamp == 0x11) {
      alarm = ctx_open_session("PHYAC");
      EXPECT_EQ(setOption(alarm, R"({"mode": 1, "logN": 1, "classMask": 2})"),
                (Negotiated{0, properties({{41, 0}, {43, spans(4, 2)}, {44, 2}, {42, 255}})}));
    }
    SCOPED_TRACE(timestamp);
    const Bytes input = activity(timestamp, {item});
    EXPECT_EQ(dispatch(map, input), toMap ? made(activity(timestamp, {*toMap})) : kNothing);
    EXPECT_EQ(dispatch(diary, input), toDiary ? made(activity(timestamp, *toDiary)) : kNothing);
    if (alarm == nullptr) continue;
    EXPECT_EQ(dispatch(alarm, input), toAlarm ? made(activity(timestamp, {*toAlarm})) : kNothing);
  }
  EXPECT_EQ(closeSession(map), (Negotiated{1, properties({{41, 1}, {43, spans(2, 2)}, {44, 2}, {42, 255}})}));
  EXPECT_EQ(closeSession(alarm), (Negotiated{1, properties({{41, 1}, {43, spans(2, 2)}, {44, 2}, {42, 255}})}));
  EXPECT_EQ(closeSession(diary), kStopped);
}

}  // namespace
}  // namespace api
