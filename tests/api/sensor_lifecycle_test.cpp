#include <numeric>
#include <random>
#include <set>

#include "client.h"

// Sensors by name, sessions by handle, and what a teardown leaves of both.
namespace api {
namespace {

using Calls = std::vector<std::string>;

const Calls kAwareSwitchedOn = {"get aware.primary", "open aware_hw_if", "activate"};

bool anySensorMade() {
  return std::any_of(kSensors.begin(), kSensors.end(), [](const char* name) { return getSensor(name) != nullptr; });
}

TEST(SensorNames, AreMatchedExactly) {
  for (const char* name : kSensors) {
    void* const handle = ctx_open_session(name);
    EXPECT_NE(handle, nullptr) << name;
    EXPECT_EQ(closeSession(handle), kStopped) << name;
  }
  for (const char* name : {"", "PHYA", "PHYACX", "PHYAC ", " PHYAC", "phyac", "Stap", "LPE", "LPE_p", "PDRPDRPDR",
                           "PHYACabcdef", "STAPabcdefghijklmnopqrstuvwxyz", "\xFF"}) {
    EXPECT_EQ(ctx_open_session(name), nullptr) << name;
  }
  EXPECT_EQ(ctx_open_session(nullptr), nullptr);
}

TEST(GetSensor, KnowsNoSensorBeforeTheFirstCallThatMakesThem) {
  EXPECT_FALSE(anySensorMade());
  EXPECT_FALSE(anySensorMade());
}

TEST(GetSensor, FindsTheTwelveByTheirFullNames) {
  EXPECT_EQ(ctx_open_session("no sensor"), nullptr);
  std::set<void*> found;
  for (const char* name : kSensors) found.insert(getSensor(name));
  EXPECT_EQ(found.size(), kSensors.size());
  EXPECT_EQ(found.count(nullptr), 0U);
  for (const char* name : {"", "phyac", "PHYACX", "PHYA"}) EXPECT_EQ(getSensor(name), nullptr) << name;
  EXPECT_EQ(getSensor(nullptr), nullptr);
}

// Each entry point that needs the sensors, with arguments that are good and a handle that is none.
struct FirstCall {
  const char* name;
  void (*call)();
};
void PrintTo(const FirstCall& call, std::ostream* out) {
  *out << call.name;
}

class FirstCalls : public ::testing::TestWithParam<FirstCall> {};

TEST_P(FirstCalls, MakeAllTwelveSensors) {
  GetParam().call();
  for (const char* name : kSensors) EXPECT_NE(getSensor(name), nullptr) << name;
  EXPECT_EQ(platform().calls, Calls{});
  EXPECT_EQ(platform().takeLog(), Log{});
}

int no_session = 0;

INSTANTIATE_TEST_SUITE_P(
    OfEveryEntryPoint, FirstCalls,
    ::testing::Values(FirstCall{"Open", [] { EXPECT_EQ(ctx_open_session("stap"), nullptr); }},
                      FirstCall{"OpenWithNull", [] { EXPECT_EQ(ctx_open_session(nullptr), nullptr); }},
                      FirstCall{"SetOption", [] { EXPECT_EQ(setOption(&no_session, "{}"), kFailed); }},
                      FirstCall{"Dispatch", [] { EXPECT_EQ(dispatch(&no_session, {1}), kRefused); }},
                      FirstCall{"Close", [] { EXPECT_EQ(closeSession(&no_session), kFailed); }}),
    [](const auto& test) { return test.param.name; });

TEST(RefusedCalls, WriteNothingAndMakeNoSensors) {
  uint8_t byte = 0;
  void* out = &byte;
  int outLength = 5;
  struct {
    void* handle;
    void* data;
    int length;
    void** out;
    int* outLength;
  } const dispatches[] = {
      {&no_session, nullptr, 1, &out, &outLength}, {nullptr, &byte, 1, &out, &outLength},
      {&no_session, &byte, -1, &out, &outLength},  {&no_session, &byte, INT32_MIN, &out, &outLength},
      {&no_session, &byte, 1, &out, nullptr},      {&no_session, &byte, 1, nullptr, &outLength},
      {nullptr, nullptr, -1, nullptr, nullptr},
  };
  for (const auto& call : dispatches) {
    EXPECT_EQ(ctx_dispatch_data(call.handle, call.data, call.length, call.out, call.outLength), -1);
  }
  EXPECT_EQ(out, &byte);
  EXPECT_EQ(outLength, 5);

  ctx_option_t* list = somewhere();
  EXPECT_EQ(ctx_set_option(&no_session, 0, nullptr, &list), -1);
  EXPECT_EQ(ctx_set_option(nullptr, 0, "{}", &list), -1);
  EXPECT_EQ(ctx_set_option(&no_session, 0, "{}", nullptr), -1);
  EXPECT_EQ(ctx_close_session(nullptr, &list), -1);
  EXPECT_EQ(ctx_close_session(&no_session, nullptr), -1);
  EXPECT_EQ(ctx_close_session(nullptr, nullptr), -1);
  EXPECT_EQ(list, somewhere());

  EXPECT_FALSE(anySensorMade());
}

TEST(RefusedCalls, LeaveTheSessionOpen) {
  void* const handle = ctx_open_session("SHAKI");
  EXPECT_EQ(ctx_close_session(handle, nullptr), -1);
  ctx_option_t* list = somewhere();
  EXPECT_EQ(ctx_set_option(handle, 0, nullptr, &list), -1);
  EXPECT_EQ(list, somewhere());
  EXPECT_EQ(platform().takeLog(), Log{});
  EXPECT_EQ(dispatch(handle, {1, 2}), handedBack({1, 2}));
  EXPECT_EQ(closeSession(handle), kStopped);
}

TEST(Handles, AreOneForEachSessionAndRefusedWhenUnknown) {
  void* const first = ctx_open_session("PHYAC");
  void* const second = ctx_open_session("PHYAC");
  ASSERT_NE(first, nullptr);
  ASSERT_NE(second, nullptr);
  EXPECT_NE(first, second);

  void* const inside = static_cast<uint8_t*>(first) + 1;
  for (void* unknown : {inside, static_cast<void*>(&no_session), getSensor("PHYAC")}) {
    EXPECT_EQ(setOption(unknown, "{}"), kFailed);
    EXPECT_EQ(dispatch(unknown, activity(1, {1})), kRefused);
    EXPECT_EQ(closeSession(unknown), kFailed);
  }
  EXPECT_EQ(platform().takeLog(), Log{});

  EXPECT_EQ(closeSession(first).result, 1);
  EXPECT_EQ(setOption(first, "{}"), kFailed);
  EXPECT_EQ(dispatch(first, activity(1, {1})), kRefused);
  EXPECT_EQ(closeSession(first), kFailed);
  EXPECT_EQ(closeSession(second), kStopped);
  EXPECT_EQ(closeSession(second), kFailed);
}

TEST(Handles, AreFoundAmongThousandsInAnyOrderOfClosing) {
  std::vector<void*> open(3000);
  for (size_t i = 0; i < open.size(); ++i) open[i] = ctx_open_session(kSensors[i % kSensors.size()]);
  EXPECT_EQ(std::set<void*>(open.begin(), open.end()).size(), open.size());

  std::vector<size_t> order(open.size());
  std::iota(order.begin(), order.end(), size_t{0});
  std::shuffle(order.begin(), order.end(), std::mt19937(1));
  // Negotiations take as long as there are sessions, so most sessions leave their sensor before they are closed.
  ctx_uninit();
  std::vector<bool> closed(open.size());
  for (size_t n = 0; n < order.size(); ++n) {
    EXPECT_EQ(closeSession(open[order[n]]).result, 0);
    closed[order[n]] = true;
    if (n % 100 != 0) continue;
    for (size_t i = 0; i < open.size(); ++i) {
      const Bytes empty = record(0, int16_t{0}, uint16_t{0}, uint32_t{}, uint32_t{}, uint32_t{});
      ASSERT_EQ(dispatch(open[i], empty).result == -1, closed[i]) << i;
    }
  }
}

TEST(Sensor, StartsWithItsFirstSessionAndStopsWithItsLast) {
  void* const first = ctx_open_session("LPE_P");
  EXPECT_EQ(platform().calls, kAwareSwitchedOn);
  void* const second = ctx_open_session("LPE_P");
  EXPECT_EQ(platform().calls, kAwareSwitchedOn);
  EXPECT_EQ(closeSession(first).result, 1);
  EXPECT_EQ(platform().calls, kAwareSwitchedOn);

  platform().calls.clear();
  EXPECT_EQ(closeSession(second), kStopped);
  EXPECT_EQ(platform().calls, (Calls{"deactivate", "close"}));

  platform().calls.clear();
  void* const again = ctx_open_session("LPE_P");
  EXPECT_EQ(platform().calls, kAwareSwitchedOn);
  EXPECT_EQ(closeSession(again), kStopped);
}

TEST(Sensor, ThatCannotStartOpensNoSession) {
  platform().activateResult = -5;
  EXPECT_EQ(ctx_open_session("LPE_P"), nullptr);
  EXPECT_EQ(ctx_open_session("LPE_P"), nullptr);
  EXPECT_EQ(platform().calls, (Calls{"get aware.primary", "open aware_hw_if", "activate", "activate"}));

  platform().activateResult = 0;
  void* const handle = ctx_open_session("LPE_P");
  EXPECT_NE(handle, nullptr);
  EXPECT_EQ(closeSession(handle), kStopped);  // the refused ones left nothing in the sensor's queue
}

TEST(Sensor, ThatCannotStopHasItsLastSessionClosedAllTheSame) {
  void* const handle = ctx_open_session("LPE_P");
  platform().deactivateResult = -5;
  EXPECT_EQ(closeSession(handle), kFailed);
  EXPECT_EQ(closeSession(handle), kFailed);
  EXPECT_EQ(dispatch(handle, {1}), kRefused);
  platform().calls.clear();

  platform().deactivateResult = 0;
  void* const again = ctx_open_session("LPE_P");  // still on: nothing to switch
  EXPECT_EQ(platform().calls, Calls{});
  EXPECT_EQ(closeSession(again), kStopped);
  EXPECT_EQ(platform().calls, (Calls{"deactivate", "close"}));
}

TEST(Sensor, KeepsTheValuesOfItsLastListWhenItStops) {
  void* const handle = ctx_open_session("STAP");
  const auto [result, list] = setAndKeep(handle, R"({"classMask": 1, "level": 4})");
  EXPECT_EQ(result, 0);
  EXPECT_EQ(closeSession(handle), kStopped);
  void* const next = ctx_open_session("STAP");
  EXPECT_EQ(read(list), properties({{101, 1}, {102, 4}}));
  EXPECT_EQ(closeSession(next), kStopped);
  EXPECT_EQ(read(list), properties({{101, 1}, {102, 4}}));
}

TEST(Uninit, DoesNothingWithoutSensors) {
  ctx_uninit();
  ctx_uninit();
  EXPECT_FALSE(anySensorMade());
  EXPECT_EQ(closeSession(ctx_open_session("STAP")), kStopped);
  ctx_uninit();
  ctx_uninit();
}

TEST(Uninit, LeavesTheOldPointersForGetSensorUntilSensorsAreMadeAgain) {
  EXPECT_EQ(ctx_open_session(""), nullptr);
  std::vector<void*> before;
  for (const char* name : kSensors) before.push_back(getSensor(name));
  ctx_uninit();
  for (size_t i = 0; i < before.size(); ++i) EXPECT_EQ(getSensor(kSensors[i]), before[i]);

  void* const handle = ctx_open_session("STAP");
  std::set<void*> after;
  for (const char* name : kSensors) after.insert(getSensor(name));
  EXPECT_EQ(after.size(), kSensors.size());
  EXPECT_EQ(setOption(handle, "{}"), (Negotiated{0, properties({{101, 3}, {102, 0}})}));
  EXPECT_EQ(closeSession(handle), kStopped);
}

TEST(Uninit, LeavesSessionsOpen) {
  void* const batching = ctx_open_session("PHYAC");
  EXPECT_EQ(setOption(batching, R"({"logN": 1})").result, 0);
  EXPECT_EQ(dispatch(batching, activity(1, {0x0011})), kNothing);
  platform().takeLog();
  ctx_uninit();

  EXPECT_EQ(dispatch(batching, activity(2, {0x0021})), made(activity(2, {0x0011})));
  EXPECT_EQ(closeSession(batching), kStopped);
  EXPECT_EQ(dispatch(batching, activity(3, {0x0031})), kRefused);
  EXPECT_EQ(platform().takeLog(), Log{});
}

TEST(Uninit, MakesLaterSessionsTheFirstOfNewSensors) {
  void* const old = ctx_open_session("STAP");
  EXPECT_EQ(setOption(old, R"({"classMask": 1})").result, 0);
  ctx_uninit();
  void* const fresh = ctx_open_session("STAP");
  platform().takeLog();

  EXPECT_EQ(setOption(fresh, R"({"classMask": 2})"), (Negotiated{0, properties({{101, 2}, {102, 0}})}));
  EXPECT_EQ(platform().takeLog(), negotiation("STAP", {fresh}));
  // The new sensor's queue is without the old session, and so not empty when that one is closed.
  EXPECT_EQ(closeSession(old), (Negotiated{1, properties({{101, 2}, {102, 0}})}));
  EXPECT_EQ(platform().takeLog(), negotiation("STAP", {fresh}));
  EXPECT_EQ(closeSession(fresh), kStopped);
}

TEST(Uninit, LetsOldSessionsNegotiateWithNobodyButNewOnes) {
  void* const old = ctx_open_session("SHAKI");
  ctx_uninit();
  EXPECT_EQ(setOption(old, R"({"sensitivity": 2})"), (Negotiated{0, properties({{81, 2}})}));
  EXPECT_EQ(platform().takeLog(), Log{});

  void* const fresh = ctx_open_session("SHAKI");
  EXPECT_EQ(setOption(old, R"({"sensitivity": 0})"),
            (Negotiated{0, properties({{81, 1}})}));  // 1: the new one's default
  EXPECT_EQ(platform().takeLog(), negotiation("SHAKI", {fresh}));
  EXPECT_EQ(setOption(fresh, R"({"sensitivity": 0})"), (Negotiated{0, properties({{81, 0}})}));
  EXPECT_EQ(platform().takeLog(), negotiation("SHAKI", {fresh}));
  EXPECT_EQ(closeSession(fresh), kStopped);
  EXPECT_EQ(closeSession(old), kStopped);
}

TEST(Uninit, LeavesOldActivitySessionsWithTheChainThatTheyHad) {
  void* const old = ctx_open_session("PHYAC");
  EXPECT_EQ(setOption(old, R"({"summary": 0})").result, 0);
  ctx_uninit();
  EXPECT_EQ(setOption(old, R"({"summary": 0, "classMask": 2})"),
            (Negotiated{0, properties({{41, 0}, {43, 0x10001}, {44, 1}, {42, 2}})}));
  EXPECT_EQ(dispatch(old, activity(1, {0x0013})), made(activity(1, {0x0013})));  // not masked
  EXPECT_EQ(closeSession(old), kStopped);
}

TEST(Uninit, LeavesTheAudioSessionOnForTheNextSensorToSwitchOff) {
  void* const old = ctx_open_session("LPE_P");
  platform().calls.clear();
  ctx_uninit();
  EXPECT_EQ(platform().calls, Calls{});
  EXPECT_TRUE(gIsActivated);
  EXPECT_EQ(dispatch(old, {}), handedBack({}));

  EXPECT_EQ(closeSession(old), kStopped);  // of a sensor that was never started
  EXPECT_EQ(platform().calls, (Calls{"deactivate", "close"}));
}

TEST(Uninit, LeavesTheGestureEngineRunningForItsSessions) {
  void* const old = ctx_open_session("GSPX");
  ctx_uninit();
  void* const fresh = ctx_open_session("GSPX");
  EXPECT_EQ(closeSession(fresh), kStopped);
  EXPECT_EQ(platform().gestureCloses, 0);
  EXPECT_EQ(closeSession(old), kStopped);
  EXPECT_EQ(platform().gestureCloses, 1);
  EXPECT_EQ(platform().gestureInitials.size(), 1U);
}

}  // namespace
}  // namespace api
