#include "client.h"

// The sensors whose sessions decide about each record by itself or, dead reckoning, gather several into one.
namespace api {
namespace {

void* openWith(const char* sensor, const std::string& option) {
  void* const handle = ctx_open_session(sensor);
  EXPECT_EQ(setOption(handle, option).result, 0);
  return handle;
}

// Which values at byte 8 a client with that class mask gets; 0 as mask: no option set.
struct Filter {
  const char* sensor;
  int32_t mask;
  std::vector<int16_t> delivered;
  std::vector<int16_t> dropped;
};

void PrintTo(const Filter& filter, std::ostream* out) {
  *out << filter.sensor << " with mask " << filter.mask;
}

class FilteredSensors : public ::testing::TestWithParam<Filter> {};

TEST_P(FilteredSensors, DeliverTheRecordsOfWantedClassesAsTheyAre) {
  const auto& [sensor, mask, delivered, dropped] = GetParam();
  void* const handle = ctx_open_session(sensor);
  const std::string mode = sensor == std::string("DTWGS") ? R"("mode": 4, )" : "";
  if (mask != 0) {
    EXPECT_EQ(setOption(handle, "{" + mode + R"("classMask": )" + std::to_string(mask) + "}").result, 0);
  }
  // Instant activity has 32 bits there: the sign goes on in bytes 10 and 11.
  for (const int16_t value : delivered) {
    const Bytes bytes = record(0x1122334455667788, int32_t{value}, uint16_t{0xABCD});
    EXPECT_EQ(dispatch(handle, bytes), handedBack(bytes)) << value;
  }
  for (const int16_t value : dropped) {
    EXPECT_EQ(dispatch(handle, record(0x1122334455667788, int32_t{value}, uint16_t{0xABCD})), kNothing) << value;
  }
  EXPECT_EQ(closeSession(handle), kStopped);
}

// A class number tests its bit, class 1 the first, modulo 32; a class set any common bit, with the sign's bits.
INSTANTIATE_TEST_SUITE_P(
    Of, FilteredSensors,
    ::testing::Values(
        Filter{"GSFLK", 0, {1, 2, 3, 4, 5, 6, 33, 38, -31, -26}, {0, 7, 31, 32, 39, -1, -32, INT16_MIN, INT16_MAX}},
        Filter{"GSFLK", 36, {3, 6, 35, 38, -29, -26}, {1, 2, 4, 5, 7, 0, 32, 36}},
        Filter{"GSETH", 0, {1, 2, 33, 34, -31, -30}, {0, 3, 4, 32, 35, -1, INT16_MIN, INT16_MAX}},
        Filter{"GSETH", 2, {2, 34, -30}, {0, 1, 3, 33}},
        Filter{"ISACT", 0, {1, 2, 3, 4, 33, 36, -31, -28}, {0, 5, 8, 32, 37, -1, INT16_MIN, INT16_MAX}},
        Filter{"ISACT", 9, {1, 4, 33, 36}, {0, 2, 3, 5, 34}},
        Filter{"STAP", 0, {1, 2, 3, 5, 6, 7, -1, -2, INT16_MAX}, {0, 4, 8, 0x7FFC, -4, INT16_MIN}},
        Filter{"STAP", 1, {1, 3, 5, -1}, {0, 2, 4, 6, -2}}, Filter{"DTWGS", 0, {}, {0, 1, 2, 3, -1}},
        Filter{"DTWGS", 1, {1, 3, 5, -1}, {0, 2, 4, 6, -2}}, Filter{"DTWGS", 3, {1, 2, 3, -1}, {0, 4, -4, INT16_MIN}}),
    [](const auto& test) {
      return test.param.sensor +
             (test.param.mask == 0 ? std::string("ByDefault") : "WithMask" + std::to_string(test.param.mask));
    });

TEST(FilteredSensors, DropRecordsTooShortForTheirClass) {
  const struct {
    const char* sensor;
    size_t needed;
  } kinds[] = {{"STAP", 10}, {"GSFLK", 10}, {"GSETH", 10}, {"ISACT", 12}};
  for (const auto& [sensor, needed] : kinds) {
    void* const handle = ctx_open_session(sensor);
    Bytes bytes = record(1, int32_t{1});
    bytes.resize(needed);
    EXPECT_EQ(dispatch(handle, bytes), handedBack(bytes)) << sensor;
    bytes.pop_back();
    EXPECT_EQ(dispatch(handle, bytes), kNothing) << sensor;
    EXPECT_EQ(dispatch(handle, {}), kNothing) << sensor;
  }
}

TEST(FilteredSensors, FilterByTheClientsOwnMaskAndNotByTheMergedOne) {
  void* const first = openWith("GSFLK", R"({"classMask": 1})");
  void* const second = openWith("GSFLK", R"({"classMask": 2})");
  const Bytes one = record(1, int16_t{1});
  const Bytes two = record(2, int16_t{2});
  EXPECT_EQ(dispatch(first, one), handedBack(one));
  EXPECT_EQ(dispatch(first, two), kNothing);
  EXPECT_EQ(dispatch(second, one), kNothing);
  EXPECT_EQ(dispatch(second, two), handedBack(two));
}

TEST(InstantActivity, ReadsAClassOf32Bits) {
  void* const handle = ctx_open_session("ISACT");
  const Bytes lowest = record(1, INT32_MIN);  // one less wraps to the largest: bit 31
  EXPECT_EQ(dispatch(handle, lowest), kNothing);
  const Bytes wide = record(1, int32_t{0x7FFF0000} + 1);
  EXPECT_EQ(dispatch(handle, wide), handedBack(wide));
}

TEST(Tapping, BadLevelLeavesTheClientWithoutTaps) {
  void* const handle = openWith("STAP", R"({"classMask": 3, "level": 6})");
  for (const int16_t taps : std::initializer_list<int16_t>{1, 2, 3, -1})
    EXPECT_EQ(dispatch(handle, record(1, taps)), kNothing);
}

TEST(UnfilteredSensors, HandBackEveryRecord) {
  for (const char* sensor : {"SHAKI", "LPE_P", "LIFT"}) {
    void* const handle = ctx_open_session(sensor);
    for (const Bytes& any : {Bytes{}, Bytes{0}, Bytes(9, 0xFF), record(1, int16_t{0}), Bytes(5000, 0x11)}) {
      EXPECT_EQ(dispatch(handle, any), handedBack(any)) << sensor;
    }
    setOption(handle, "{}");
    EXPECT_EQ(dispatch(handle, {}), handedBack({})) << sensor;
  }
}

TEST(StepCount, Mode1DeliversEveryUpdate) {
  void* const handle = ctx_open_session("SCOUN");  // the default
  for (const Bytes& any : {Bytes{}, Bytes{0}, Bytes(11), record(1, int32_t{7}), record(2, int32_t{-7})}) {
    EXPECT_EQ(dispatch(handle, any), handedBack(any));
  }
  setOption(handle, R"({"mode": 2, "logN": 5})");  // any other mode is 1
  EXPECT_EQ(dispatch(handle, record(1, int32_t{7})), handedBack(record(1, int32_t{7})));
}

TEST(StepCount, Mode0DeliversMultiplesOfSoManyHundredStepsAlone) {
  const struct {
    int logN;
    std::vector<int32_t> delivered;
    std::vector<int32_t> dropped;
  } settings[] = {
      {1, {0, 100, 200, -100, 65600, 2147483600}, {1, 50, 99, 101, 150, -99, INT32_MAX, INT32_MIN}},
      {3, {0, 300, 600, -300}, {100, 200, 301, -100}},
      {100, {0, 10000, -20000, 2147480000}, {100, 5000, 9999, 10001}},
  };
  void* const handle = ctx_open_session("SCOUN");
  for (const auto& [logN, delivered, dropped] : settings) {
    setOption(handle, R"({"mode": 0, "logN": )" + std::to_string(logN) + "}");
    for (const int32_t steps : delivered) {
      EXPECT_EQ(dispatch(handle, record(1, steps)), handedBack(record(1, steps))) << steps;
    }
    for (const int32_t steps : dropped) EXPECT_EQ(dispatch(handle, record(1, steps)), kNothing) << steps;
    for (size_t length = 0; length < 12; ++length) EXPECT_EQ(dispatch(handle, Bytes(length)), kNothing) << length;
  }
}

TEST(StepCount, KeepsItsOptionWhenAStringIsNoJson) {
  void* const handle = openWith("SCOUN", R"({"mode": 0, "logN": 2})");
  EXPECT_EQ(setOption(handle, "two"), (Negotiated{0, properties({{141, 0}, {142, 2}})}));
  EXPECT_EQ(dispatch(handle, record(1, int32_t{100})), kNothing);
}

// --- dead reckoning

// An item of 28 bytes, all of that value.
Bytes item(uint8_t value) {
  return Bytes(28, value);
}

// A record of one item for each of the values.
Bytes items(uint64_t timestamp, const Bytes& values) {
  Bytes bytes = record(timestamp, static_cast<int16_t>(values.size()));
  for (const uint8_t value : values) {
    const Bytes one = item(value);
    bytes.insert(bytes.end(), one.begin(), one.end());
  }
  return bytes;
}

TEST(DeadReckoning, DeliversEveryRecordByDefault) {
  void* const handle = ctx_open_session("PDR");
  EXPECT_EQ(dispatch(handle, items(1, {1})), made(items(1, {1})));
  EXPECT_EQ(dispatch(handle, items(2, {2, 3})), made(items(2, {2, 3})));
  EXPECT_EQ(dispatch(handle, items(3, {})), kNothing);  // nothing is pending, and nothing was added
}

TEST(DeadReckoning, GathersItemsUntilTheyAreEnough) {
  void* const handle = openWith("PDR", R"({"N": 2})");
  EXPECT_EQ(dispatch(handle, items(1, {1})), kNothing);
  EXPECT_EQ(dispatch(handle, items(2, {2})), kNothing);
  EXPECT_EQ(dispatch(handle, items(3, {3})), kNothing);
  EXPECT_EQ(dispatch(handle, items(0x8877665544332211, {4})), made(items(0x8877665544332211, {1, 2, 3, 4})));
  EXPECT_EQ(dispatch(handle, items(5, {5})), kNothing);
  // What a record brings is delivered whole, however much more than enough it is.
  EXPECT_EQ(dispatch(handle, items(6, {6, 7, 8, 9})), made(items(6, {5, 6, 7, 8, 9})));
}

TEST(DeadReckoning, DeliversFromEveryThresholdOn) {
  void* const handle = ctx_open_session("PDR");
  for (int n = 0; n <= 6; ++n) {
    setOption(handle, R"({"N": )" + std::to_string(n) + "}");
    Bytes gathered;
    for (uint8_t i = 1; i < 1 << n; ++i) {
      gathered.push_back(i);
      EXPECT_EQ(dispatch(handle, items(i, {i})), kNothing) << n;
    }
    gathered.push_back(0xFF);
    EXPECT_EQ(dispatch(handle, items(99, {0xFF})), made(items(99, gathered))) << n;
  }
}

TEST(DeadReckoning, RefusesWhatItCannotHoldAndChangesNothing) {
  void* const handle = openWith("PDR", R"({"N": 6})");
  EXPECT_EQ(dispatch(handle, items(1, Bytes(60, 1))), kNothing);
  Bytes cut = items(2, {2, 3});
  cut.pop_back();
  Bytes negative = items(3, {});
  negative[8] = negative[9] = 0xFF;
  for (const Bytes& bad : {Bytes{}, Bytes(9), cut, negative, items(4, Bytes(5, 4)), items(5, Bytes(64, 5))}) {
    EXPECT_EQ(dispatch(handle, bad), kRefused);
  }
  Bytes whole(60, 1);
  whole.insert(whole.end(), 4, 6);
  EXPECT_EQ(dispatch(handle, items(6, Bytes(4, 6))), made(items(6, whole)));
  EXPECT_EQ(dispatch(handle, items(7, Bytes(65, 7))), kRefused);
  EXPECT_EQ(dispatch(handle, items(8, Bytes(64, 8))), made(items(8, Bytes(64, 8))));
}

TEST(DeadReckoning, AppliesANewThresholdToWhatIsPending) {
  void* const handle = openWith("PDR", R"({"N": 2})");
  EXPECT_EQ(dispatch(handle, items(1, {1, 2, 3})), kNothing);
  EXPECT_EQ(setOption(handle, "{"), kFailed);
  setOption(handle, R"({"N": 0})");
  EXPECT_EQ(dispatch(handle, items(2, {})), made(items(2, {1, 2, 3})));
}

TEST(DeadReckoning, GathersForEachClientByItsOwnThreshold) {
  void* const often = ctx_open_session("PDR");
  void* const seldom = openWith("PDR", R"({"N": 1})");
  EXPECT_EQ(dispatch(often, items(1, {1})), made(items(1, {1})));
  EXPECT_EQ(dispatch(seldom, items(1, {1})), kNothing);
  EXPECT_EQ(dispatch(seldom, items(2, {2})), made(items(2, {1, 2})));
}

TEST(DeadReckoning, IgnoresBytesBehindTheItems) {
  void* const handle = ctx_open_session("PDR");
  Bytes longer = items(1, {1});
  longer.resize(5000, 0xEE);
  EXPECT_EQ(dispatch(handle, longer), made(items(1, {1})));
}

}  // namespace
}  // namespace api
