#include <cstdlib>
#include <iostream>
#include <random>

#include "client.h"

// Random calls of all entry points. What each must return, log and leave open is told by a plain record of which
// sessions are open and which of them their sensor knows.
namespace api {
namespace {

constexpr int kCalls = 20000;

uint32_t seed() {
  const char* const given = std::getenv("SENSELOOM_TEST_SEED");
  return given != nullptr ? static_cast<uint32_t>(std::strtoul(given, nullptr, 10)) : std::random_device{}();
}

// Option strings that are accepted, for all sensors but "DTWGS", whose sessions can conflict.
const char* const kGoodStrings[] = {
    "{}",
    "[]",
    R"({"mode": 1, "logN": 2, "classMask": 7})",
    R"({"mode": 0, "logN": 12, "logM": 3, "summary": 0, "weightVar": 0})",
    R"({"classMask": -5, "level": 9, "sensitivity": 1.5, "continuous": true})",
    R"({"N": 3, "userHeight": 180, "floorHeight": 300, "6DOF": 1, "interval": -1})",
    R"({"N": -3, "userHeight": "high", "sensitivity": 2, "level": -2})",
};
const char* const kTemplateStrings[] = {
    "{}",
    R"({"mode": 1})",
    R"({"mode": 4, "classMask": 3, "template1": "0002abcd"})",
    R"({"mode": 4, "classMask": 1, "level": -1, "template2": "0384ff"})",
    R"({"mode": 4, "classMask": 2, "template2": "bad"})",
};
const char* const kBadStrings[] = {"", "{", "nonsense", "{\"mode\": }", "\xFF"};

struct Open {
  void* handle;
  size_t sensor;
  bool known;  // to its sensor: opened since the last teardown
};

class RandomCalls : public ::testing::Test {
 protected:
  size_t below(size_t limit) { return static_cast<size_t>(random_()) % limit; }
  bool oneIn(size_t n) { return below(n) == 0; }

  template <class Choice, size_t kChoices>
  Choice anyOf(const Choice (&choices)[kChoices]) {
    return choices[below(kChoices)];
  }

  std::vector<void*> knownTo(size_t sensor) const {
    std::vector<void*> handles;
    for (const Open& open : open_) {
      if (open.known && open.sensor == sensor) handles.push_back(open.handle);
    }
    return handles;
  }

  static bool is(size_t sensor, const char* name) { return kSensors[sensor] == std::string(name); }

  // The negotiation's part of the log.
  static Log negotiated() {
    Log log = platform().takeLog();
    std::erase_if(log, [](const LogLine& line) { return line.tag != "Libsl"; });
    return log;
  }

  // Some of the platform's next answers.
  void preparePlatform() {
    platform().activateResult = oneIn(4) ? -1 : 0;
    platform().deactivateResult = oneIn(4) ? -1 : 0;
    platform().gestureStarts = !oneIn(4);
    platform().gestureNames.clear();
    for (size_t i = below(4); i > 0; --i) {
      platform().gestureNames.push_back(oneIn(3) ? std::nullopt : std::optional<std::string>("LetterB "));
    }
    platform().groups.clear();
    platform().takeLog();
  }

  void open() {
    const size_t sensor = below(kSensors.size());
    const bool starts = gIsActivated || platform().activateResult == 0;
    const bool fails = is(sensor, "LPE_P") && knownTo(sensor).empty() && !starts;
    void* const handle = ctx_open_session(kSensors[sensor]);
    ASSERT_EQ(handle == nullptr, fails);
    if (handle == nullptr) return;
    for (const Open& other : open_) ASSERT_NE(handle, other.handle);
    open_.push_back({handle, sensor, true});
    ASSERT_EQ(negotiated(), Log{});
  }

  void setAnOption() {
    if (open_.empty()) return;
    const Open& client = open_[below(open_.size())];
    const bool bad = oneIn(5);
    const bool templates = is(client.sensor, "DTWGS");
    const bool anyStringIsGood = is(client.sensor, "SCOUN") || is(client.sensor, "ISACT");
    const char* const text = bad ? anyOf(kBadStrings) : templates ? anyOf(kTemplateStrings) : anyOf(kGoodStrings);
    const Negotiated outcome = setOption(client.handle, text);
    ASSERT_EQ(outcome.result == 0, outcome.list.has_value());
    const Log log = negotiated();
    if (templates && !bad) {
      ASSERT_TRUE(outcome.result == 0 || outcome.result == -1);
      ASSERT_TRUE(log.empty() || log == negotiation("DTWGS", knownTo(client.sensor)));
    } else {
      const bool accepted = !bad || anyStringIsGood;
      ASSERT_EQ(outcome.result, accepted ? 0 : -1) << text;
      ASSERT_EQ(log, accepted ? negotiation(kSensors[client.sensor], knownTo(client.sensor)) : Log{});
    }
  }

  void dispatchARecord() {
    if (open_.empty()) return;
    const Open& client = open_[below(open_.size())];
    Bytes record(oneIn(10) ? below(2100) : below(130));
    for (uint8_t& byte : record) byte = static_cast<uint8_t>(random_());
    // Counts and times that mean something, mostly.
    if (record.size() >= 12 && !oneIn(5)) {
      const auto items = static_cast<uint16_t>(below(5));
      std::memcpy(record.data() + 8, &items, sizeof items);
      const auto size = static_cast<uint16_t>(record.size() - 12);
      if (is(client.sensor, "GSPX")) std::memcpy(record.data() + 10, &size, sizeof size);
      if (oneIn(2)) std::fill(record.begin(), record.begin() + 8, uint8_t{1});
    }
    const Delivery delivery = dispatch(client.handle, record, below(2));
    ASSERT_TRUE(delivery.result >= -1 && delivery.result <= 1);
    ASSERT_TRUE(!delivery.handedBack || delivery.record == record);
    ASSERT_LE(delivery.record.size(), std::max<size_t>(record.size(), 2052));
    ASSERT_EQ(negotiated(), Log{});
  }

  void close(size_t index) {
    const Open client = open_[index];
    open_.erase(open_.begin() + static_cast<std::ptrdiff_t>(index));
    const auto remaining = knownTo(client.sensor);
    const bool stops = !is(client.sensor, "LPE_P") || !gIsActivated || platform().deactivateResult == 0;
    const Negotiated outcome = closeSession(client.handle);
    if (remaining.empty()) {
      ASSERT_EQ(outcome, stops ? kStopped : kFailed);
    } else {
      ASSERT_EQ(outcome.result, 1);
      ASSERT_TRUE(outcome.list.has_value() || is(client.sensor, "DTWGS"));
    }
    ASSERT_EQ(negotiated(), negotiation(kSensors[client.sensor], remaining));
    ASSERT_EQ(dispatch(client.handle, {}), kRefused);
  }

  void makeABadCall() {
    ctx_option_t* list = nullptr;
    void* const handle = open_.empty() ? nullptr : open_.front().handle;
    ASSERT_EQ(ctx_open_session(oneIn(2) ? "NOSUCH" : nullptr), nullptr);
    ASSERT_EQ(ctx_set_option(handle, 0, nullptr, &list), -1);
    ASSERT_EQ(ctx_close_session(handle, nullptr), -1);
    ASSERT_EQ(ctx_dispatch_data(handle, nullptr, 5, nullptr, nullptr), -1);
    ASSERT_EQ(setOption(this, "{}"), kFailed);
    ASSERT_EQ(dispatch(this, {1}), kRefused);
    ASSERT_EQ(closeSession(this), kFailed);
    ASSERT_EQ(negotiated(), Log{});
  }

  void tearDownSensors() {
    ctx_uninit();
    for (Open& open : open_) open.known = false;
    ASSERT_EQ(negotiated(), Log{});
  }

  std::vector<Open> open_;  // in opening order
  const uint32_t seed_ = seed();
  std::mt19937 random_{seed_};
};

TEST_F(RandomCalls, ReturnLogAndKeepOpenWhatTheyMust) {
  std::cout << "SENSELOOM_TEST_SEED=" << seed_ << std::endl;
  for (int call = 0; call < kCalls; ++call) {
    SCOPED_TRACE(call);
    preparePlatform();
    const size_t choice = below(100);
    if (choice < 20) {
      open();
    } else if (choice < 40) {
      setAnOption();
    } else if (choice < 79) {
      dispatchARecord();
    } else if (choice < 98) {
      if (!open_.empty()) close(below(open_.size()));
    } else if (choice == 98) {
      makeABadCall();
    } else {
      tearDownSensors();
    }
    if (HasFatalFailure()) return;
  }
  while (!open_.empty() && !HasFatalFailure()) {
    preparePlatform();
    close(open_.size() - 1);
  }
  ctx_uninit();
  EXPECT_EQ(platform().gestureInitials.size(), static_cast<size_t>(platform().gestureCloses));
}

}  // namespace
}  // namespace api
