#include <gtest/gtest.h>

#include <algorithm>
#include <limits>
#include <memory>
#include <set>
#include <string>

#include "allocations.h"
#include "bytes_of.h"
#include "fake_session.h"
#include "option/option_activity.h"
#include "option/option_tapping.h"
#include "registry/registry.h"
#include "senseloom.h"

// The entry points, on the registry's own sensors. Each of these tests needs a fresh process, in which no sensor was
// ever made.
namespace senseloom {
namespace {

using Events = std::vector<std::string>;
using Log = std::vector<fake::LogLine>;

ctx_option_t kUntouchedList;

class Api : public testing::Test {
 protected:
  void TearDown() override {
    releaseList();
    for (void* handle : handles) {
      if (gSessions.find(handle) != nullptr) ctx_close_session(handle, &list);
      releaseList();
    }
    ctx_uninit();
  }

  void* open(const char* sensor) {
    void* handle = ctx_open_session(sensor);
    if (handle != nullptr) handles.push_back(handle);
    return handle;
  }
  // Opens a fake session. On a name that is no sensor's it is in no sensor's list.
  fake::NamedSession* openFake(const char* sensor, const char* name) {
    ensureSensors();
    auto* session = new fake::NamedSession(sensor, name, events);
    gSessions.reserveOne();
    gSessions.insert(session);
    if (ContextSensor* on = findSensor(sensor)) on->sessions.push_back(session);
    handles.push_back(session);
    return session;
  }

  int setOption(void* handle, const char* option) {
    releaseList();
    return ctx_set_option(handle, 0, option, &list);
  }
  int close(void* handle) {
    releaseList();
    return ctx_close_session(handle, &list);
  }
  void releaseList() {
    if (list != &kUntouchedList) ctx_option_release(list);
    list = &kUntouchedList;
  }

  // Identifiers and values of the list.
  std::vector<std::pair<int, int32_t>> properties() const {
    std::vector<std::pair<int, int32_t>> all;
    for (int i = 0; i < list->count; ++i) {
      const ctx_property_t& property = list->properties[i];
      EXPECT_EQ(property.size, 4);
      all.emplace_back(property.id, *static_cast<const int32_t*>(property.value));
    }
    return all;
  }

  static std::vector<Session*>& sessionsOf(const char* sensor) { return findSensor(sensor)->sessions; }
  static bool isInitialised() { return findSensor("PHYAC") != nullptr; }

  fake::Platform& platform = fake::platform();
  Events& events = platform.calls;  // of fake sessions and of the platform, in their order
  std::vector<void*> handles;
  ctx_option_t* list = &kUntouchedList;
};
using Properties = std::vector<std::pair<int, int32_t>>;

class OpenSession : public Api {};

TEST_F(OpenSession, GivesADifferentHandleEachTimeInOpeningOrder) {
  std::set<void*> all;
  for (const char* name :
       {"PHYAC", "STAP", "GSFLK", "SHAKI", "ISACT", "SCOUN", "GSPX", "DTWGS", "GSETH", "LPE_P", "PDR", "LIFT"}) {
    std::vector<Session*> opened;
    for (int i = 0; i < 3; ++i) {
      opened.push_back(static_cast<Session*>(open(name)));
      ASSERT_NE(opened.back(), nullptr) << name;
      EXPECT_STREQ(opened.back()->name, name);
      EXPECT_EQ(gSessions.find(opened.back()), opened.back());
      all.insert(opened.back());
    }
    EXPECT_EQ(sessionsOf(name), opened);
  }
  EXPECT_EQ(all.size(), 36U);
}

TEST_F(OpenSession, RefusesOtherNamesButInitialises) {
  for (const char* name : {"", "phyac", "PHYA", "PHYAC ", "PHYACabcdef", "STAPSTAP", "unheard of"}) {
    EXPECT_EQ(open(name), nullptr) << name;
  }
  EXPECT_TRUE(isInitialised());
}

TEST_F(OpenSession, RefusesNullButInitialises) {
  EXPECT_EQ(open(nullptr), nullptr);
  EXPECT_TRUE(isInitialised());
}

TEST_F(OpenSession, LogsNothingAndMergesNothing) {
  void* first = open("STAP");
  ASSERT_EQ(setOption(first, "{}"), 0);
  platform.takeLog();
  const Option* merged = findSensor("STAP")->mergedOption.get();
  open("STAP");
  EXPECT_EQ(platform.takeLog(), Log{});
  EXPECT_EQ(findSensor("STAP")->mergedOption.get(), merged);
}

TEST_F(OpenSession, StartsTheSensorWithItsFirstSessionAlone) {
  open("LPE_P");
  EXPECT_EQ(events, (Events{"get aware.primary", "open aware_hw_if", "activate"}));
  platform.takeLog();
  open("LPE_P");
  EXPECT_EQ(events.size(), 3U);
  EXPECT_EQ(platform.takeLog(), Log{}) << "the bridge is not asked at all";
}

TEST_F(OpenSession, StartsTheSensorAnewAfterItsLastSessionWasClosed) {
  for (int round = 0; round < 2; ++round) {
    events.clear();
    void* handle = open("LPE_P");
    EXPECT_EQ(std::count(events.begin(), events.end(), "activate"), 1);
    EXPECT_EQ(close(handle), 0);
  }
}

TEST_F(OpenSession, FailsWithASensorThatDoesNotStart) {
  platform.activateResult = -1;
  EXPECT_EQ(open("LPE_P"), nullptr);
  EXPECT_TRUE(sessionsOf("LPE_P").empty());
  platform.activateResult = 0;
  EXPECT_NE(open("LPE_P"), nullptr);
  EXPECT_EQ(sessionsOf("LPE_P").size(), 1U);
}

TEST_F(OpenSession, SeldomMakesRoomForFurtherSessions) {
  ASSERT_NE(open("LIFT"), nullptr);
  handles.reserve(64);
  const fake::AllocationCount allocations;
  for (int i = 1; i < 64; ++i) ASSERT_NE(open("LIFT"), nullptr);
  // Each time the session and its option; 6 times room for the sensor's sessions: 3, 7, 15, 31, 63, 127; 3 times room
  // for all sessions, of which twice as many slots are enough: 32, 64, 128.
  EXPECT_LE(allocations.made(), 2U * 63 + 6 + 3);
}

TEST_F(OpenSession, LeavesNothingBehindWhenMemoryRunsOut) {
  handles.reserve(4);
  for (size_t opened = 0; opened < 2; ++opened) {
    size_t failures = 0;
    for (;; ++failures) {
      const fake::FailingAllocation next(failures + 1);
      void* handle = open("PHYAC");
      if (!next.happened()) {
        ASSERT_NE(handle, nullptr);
        break;
      }
      EXPECT_EQ(handle, nullptr);
      EXPECT_EQ(isInitialised() ? sessionsOf("PHYAC").size() : 0, opened);
    }
    EXPECT_GE(failures, 3U) << "session, option and result buffer at least are allocated";
    EXPECT_EQ(sessionsOf("PHYAC").size(), opened + 1);
  }
}

class Dispatch : public Api {
 protected:
  char data[4] = {};
  void* out = this;
  int outLen = -77;
};

TEST_F(Dispatch, RefusesBadArgumentsBeforeItInitialises) {
  EXPECT_EQ(ctx_dispatch_data(this, nullptr, 4, &out, &outLen), -1);
  EXPECT_EQ(ctx_dispatch_data(nullptr, data, 4, &out, &outLen), -1);
  EXPECT_EQ(ctx_dispatch_data(this, data, -1, &out, &outLen), -1);
  EXPECT_EQ(ctx_dispatch_data(this, data, std::numeric_limits<int>::min(), &out, &outLen), -1);
  EXPECT_EQ(ctx_dispatch_data(this, data, 4, &out, nullptr), -1);
  EXPECT_EQ(ctx_dispatch_data(this, data, 4, nullptr, &outLen), -1);
  EXPECT_FALSE(isInitialised());
  EXPECT_EQ(out, this);
  EXPECT_EQ(outLen, -77);
}

TEST_F(Dispatch, RefusesBadArgumentsWithALiveHandle) {
  auto* session = openFake("STAP", "a");
  EXPECT_EQ(ctx_dispatch_data(session, nullptr, 4, &out, &outLen), -1);
  EXPECT_EQ(ctx_dispatch_data(session, data, -1, &out, &outLen), -1);
  EXPECT_EQ(ctx_dispatch_data(session, data, 4, &out, nullptr), -1);
  EXPECT_EQ(ctx_dispatch_data(session, data, 4, nullptr, &outLen), -1);
  EXPECT_EQ(events, Events{});
}

TEST_F(Dispatch, RefusesUnknownHandlesAndInitialises) {
  EXPECT_EQ(ctx_dispatch_data(this, data, 4, &out, &outLen), -1);
  EXPECT_TRUE(isInitialised());
  auto* session = openFake("STAP", "a");
  EXPECT_EQ(ctx_dispatch_data(this, data, 4, &out, &outLen), -1);
  EXPECT_EQ(ctx_dispatch_data(reinterpret_cast<char*>(session) + 1, data, 4, &out, &outLen), -1);
  EXPECT_EQ(events, Events{});
}

TEST_F(Dispatch, RefusesClosedHandles) {
  void* handle = open("STAP");
  open("STAP");
  EXPECT_EQ(close(handle), 1);
  EXPECT_EQ(ctx_dispatch_data(handle, data, 4, &out, &outLen), -1);
}

TEST_F(Dispatch, ReturnsTheSessionsResultUnchanged) {
  auto* session = openFake("STAP", "a");
  for (const int result : {0, -1, 5, -9}) {
    session->processResult = result;
    EXPECT_EQ(ctx_dispatch_data(session, data, 4, &out, &outLen), result);
    EXPECT_EQ(out, this);
    EXPECT_EQ(outLen, -77);
  }
  session->processResult = 1;
  EXPECT_EQ(ctx_dispatch_data(session, data, 3, &out, &outLen), 1);
  EXPECT_EQ(out, data);
  EXPECT_EQ(outLen, 3);
}

TEST_F(Dispatch, ReachesTheSessionOfTheHandleAlone) {
  openFake("STAP", "a");
  auto* session = openFake("STAP", "b");
  EXPECT_EQ(ctx_dispatch_data(session, data, 0, &out, &outLen), 1);
  EXPECT_EQ(events, Events{"b takes 0 bytes"});
}

TEST_F(Dispatch, WorksOnASessionWhoseSensorWasDeleted) {
  auto* session = openFake("STAP", "a");
  ctx_uninit();
  EXPECT_EQ(ctx_dispatch_data(session, data, 4, &out, &outLen), 1);
  EXPECT_EQ(events, Events{"a takes 4 bytes"});
  EXPECT_TRUE(sessionsOf("STAP").empty()) << "the sensors are new";
}

class SetOption : public Api {
 protected:
  // Three fake sessions on one sensor.
  void openThree() {
    a = openFake("STAP", "a");
    b = openFake("STAP", "b");
    c = openFake("STAP", "c");
  }

  fake::NamedSession* a = nullptr;
  fake::NamedSession* b = nullptr;
  fake::NamedSession* c = nullptr;
};

TEST_F(SetOption, RefusesNullArgumentsBeforeItInitialises) {
  EXPECT_EQ(ctx_set_option(this, 0, nullptr, &list), -1);
  EXPECT_EQ(ctx_set_option(nullptr, 0, "{}", &list), -1);
  EXPECT_EQ(ctx_set_option(this, 0, "{}", nullptr), -1);
  EXPECT_EQ(list, &kUntouchedList);
  EXPECT_FALSE(isInitialised());
}

TEST_F(SetOption, RefusesUnknownHandlesAndInitialises) {
  EXPECT_EQ(setOption(this, "{}"), -1);
  EXPECT_EQ(list, nullptr);
  EXPECT_TRUE(isInitialised());
}

TEST_F(SetOption, RefusesASessionOfNoSensor) {
  auto* session = openFake("NOBODY", "a");
  EXPECT_EQ(setOption(session, "{}"), -1);
  EXPECT_EQ(list, nullptr);
  EXPECT_EQ(events, Events{});
}

TEST_F(SetOption, ParsesThenMergesACopyThenRebuilds) {
  openThree();
  findSensor("STAP")->mergedOption = std::make_unique<fake::NamedOption>("old", events);
  EXPECT_EQ(setOption(b, "text"), 0);
  EXPECT_EQ(events, (Events{"b parses text", "b cloned", "b' merges a", "b' merges b", "b' merges c", "old destroyed",
                            "b' rendered", "a built", "b built", "c built"}));
  EXPECT_EQ(platform.takeLog(), (Log{fake::mergeLine(0, 3, *a), fake::mergeLine(1, 3, *b), fake::mergeLine(2, 3, *c)}));
  ASSERT_NE(list, nullptr);
  EXPECT_EQ(list->properties[0].value, findSensor("STAP")->mergedOption.get());
}

TEST_F(SetOption, TouchesNoOtherSensor) {
  openFake("GSFLK", "other");
  openThree();
  EXPECT_EQ(setOption(a, "text"), 0);
  for (const std::string& event : events) EXPECT_EQ(event.find("other"), std::string::npos) << event;
  EXPECT_EQ(findSensor("GSFLK")->mergedOption, nullptr);
}

TEST_F(SetOption, RefusedStringChangesNothingElse) {
  openThree();
  findSensor("STAP")->mergedOption = std::make_unique<fake::NamedOption>("old", events);
  const Option* old = findSensor("STAP")->mergedOption.get();
  for (const int result : {-1, 1}) {
    events.clear();
    a->namedOption().parseResult = result;
    EXPECT_EQ(setOption(a, "text"), -1);
    EXPECT_EQ(list, nullptr);
    EXPECT_EQ(events, Events{"a parses text"});
    EXPECT_EQ(findSensor("STAP")->mergedOption.get(), old);
  }
  EXPECT_EQ(platform.takeLog(), Log{});
}

TEST_F(SetOption, ListThatCanNotBeMadeIsAFailureWithoutRebuild) {
  openThree();
  a->namedOption().renders = false;
  EXPECT_EQ(setOption(a, "text"), -1);
  EXPECT_EQ(list, nullptr);
  EXPECT_EQ(events, (Events{"a parses text", "a cloned", "a' merges a", "a' merges b", "a' merges c", "a' rendered"}));
  EXPECT_NE(findSensor("STAP")->mergedOption, nullptr);
}

TEST_F(SetOption, SessionThatCanNotBeRebuiltIsAFailureWithAList) {
  openThree();
  a->buildResult = -1;
  EXPECT_EQ(setOption(c, "text"), -1);
  ASSERT_NE(list, nullptr);
  EXPECT_EQ(list->properties[0].value, findSensor("STAP")->mergedOption.get());
  EXPECT_EQ(Events(events.end() - 3, events.end()), (Events{"a built", "b built", "c built"}));
}

TEST_F(SetOption, PositiveResultsOfRebuildingAreSuccess) {
  openThree();
  b->buildResult = 1;
  EXPECT_EQ(setOption(c, "text"), 0);
}

TEST_F(SetOption, DoesNotReadItsSecondArgument) {
  openThree();
  for (const int32_t reserved : {-1, 1, std::numeric_limits<int32_t>::min()}) {
    releaseList();
    EXPECT_EQ(ctx_set_option(a, reserved, "text", &list), 0);
  }
}

TEST_F(SetOption, AloneASessionGetsItsOwnSettings) {
  void* handle = open("STAP");
  EXPECT_EQ(setOption(handle, R"({"classMask":1,"level":-2})"), 0);
  EXPECT_EQ(properties(), (Properties{{101, 1}, {102, -2}}));
}

TEST_F(SetOption, MergesWithTheOtherSessions) {
  void* one = open("STAP");
  void* two = open("STAP");
  EXPECT_EQ(setOption(one, R"({"classMask":1,"level":2})"), 0);
  EXPECT_EQ(properties(), (Properties{{101, 3}, {102, 0}})) << "the other's defaults: both classes, level 0";
  EXPECT_EQ(setOption(two, R"({"classMask":2,"level":3})"), 0);
  EXPECT_EQ(properties(), (Properties{{101, 3}, {102, 2}}));
}

TEST_F(SetOption, LastOpenedSessionWinsWhereTheMergeSaysSo) {
  void* one = open("LPE_P");
  void* two = open("LPE_P");
  EXPECT_EQ(setOption(two, R"({"interval":2000})"), 0);
  EXPECT_EQ(setOption(one, R"({"interval":1000})"), 0);
  EXPECT_EQ(properties(), (Properties{{0, 2000}}));
}

TEST_F(SetOption, RefusedStringLeavesThePreviousListValid) {
  void* handle = open("STAP");
  ASSERT_EQ(setOption(handle, R"({"classMask":2,"level":1})"), 0);
  ctx_option_t* refused = &kUntouchedList;
  EXPECT_EQ(ctx_set_option(handle, 0, "no JSON", &refused), -1);
  EXPECT_EQ(refused, nullptr);
  EXPECT_EQ(properties(), (Properties{{101, 2}, {102, 1}}));
}

TEST_F(SetOption, RebuildsEverySessionForTheMergedOption) {
  void* one = open("PHYAC");
  void* two = open("PHYAC");
  ASSERT_EQ(setOption(one, R"({"logN":1,"logM":1})"), 0);
  ASSERT_EQ(setOption(two, R"({"logN":1,"logM":1})"), 0);
  Bytes record = bytesOf(uint64_t{1}, int16_t{1}, uint16_t{0x0051});
  void* out = nullptr;
  int outLen = 0;
  EXPECT_EQ(ctx_dispatch_data(one, record.data(), 12, &out, &outLen), 1);
  ASSERT_EQ(setOption(two, R"({"logN":1,"logM":0})"), 0);
  EXPECT_EQ(ctx_dispatch_data(one, record.data(), 12, &out, &outLen), 0) << "batches are of two now, for both";
}

TEST_F(SetOption, SessionWhoseSensorWasDeletedNegotiatesWithNobody) {
  auto* session = openFake("STAP", "a");
  ctx_uninit();
  EXPECT_EQ(setOption(session, "text"), 0);
  EXPECT_NE(list, nullptr);
  EXPECT_EQ(events, (Events{"a parses text", "a cloned", "a' rendered"}));
  EXPECT_EQ(platform.takeLog(), Log{});
}

TEST_F(SetOption, FailsWhenMemoryRunsOut) {
  void* handle = open("STAP");
  ASSERT_EQ(setOption(handle, R"({"classMask":1})"), 0);
  const ContextSensor& sensor = *findSensor("STAP");
  const Option* before = sensor.mergedOption.get();
  releaseList();
  platform.log.reserve(16);  // the fake is not to be what fails
  {
    const fake::FailingAllocation copy(1);
    EXPECT_EQ(ctx_set_option(handle, 0, R"({"classMask":2})", &list), -1);
    EXPECT_TRUE(copy.happened());
  }
  EXPECT_EQ(list, nullptr);
  EXPECT_EQ(sensor.mergedOption.get(), before);
  EXPECT_EQ(static_cast<const OptionTapping&>(*before).classMask(), 1);
}

class CloseSession : public Api {};

TEST_F(CloseSession, RefusesNullArgumentsBeforeItInitialises) {
  EXPECT_EQ(ctx_close_session(this, nullptr), -1);
  EXPECT_EQ(ctx_close_session(nullptr, &list), -1);
  EXPECT_EQ(list, &kUntouchedList);
  EXPECT_FALSE(isInitialised());
}

TEST_F(CloseSession, LeavesTheSessionOpenWithoutAPlaceForTheList) {
  auto* session = openFake("STAP", "a");
  EXPECT_EQ(ctx_close_session(session, nullptr), -1);
  EXPECT_EQ(gSessions.find(session), session);
  EXPECT_EQ(sessionsOf("STAP"), std::vector<Session*>{session});
  EXPECT_EQ(events, Events{});
}

TEST_F(CloseSession, RefusesUnknownHandlesAndInitialises) {
  EXPECT_EQ(close(this), -1);
  EXPECT_EQ(list, nullptr);
  EXPECT_TRUE(isInitialised());
  void* handle = open("STAP");
  EXPECT_EQ(close(handle), 0);
  EXPECT_EQ(close(handle), -1) << "closed already";
  EXPECT_EQ(list, nullptr);
}

TEST_F(CloseSession, ClosesASessionOfNoSensorWithAFailure) {
  auto* session = openFake("NOBODY", "a");
  EXPECT_EQ(close(session), -1);
  EXPECT_EQ(list, nullptr);
  EXPECT_EQ(gSessions.find(session), nullptr);
  EXPECT_EQ(events, (Events{"session a destroyed", "a destroyed"}));
}

TEST_F(CloseSession, StopsTheSensorAfterItsLastSessionWasDeleted) {
  ASSERT_TRUE(audio_hal_activate());
  auto* session = openFake("LPE_P", "a");
  findSensor("LPE_P")->mergedOption = std::make_unique<fake::NamedOption>("merged", events);
  events.clear();
  platform.takeLog();
  EXPECT_EQ(close(session), 0);
  EXPECT_EQ(list, nullptr);
  EXPECT_EQ(events, (Events{"session a destroyed", "a destroyed", "deactivate", "close"}));
  EXPECT_NE(findSensor("LPE_P")->mergedOption, nullptr);
  EXPECT_TRUE(sessionsOf("LPE_P").empty());
}

TEST_F(CloseSession, TellsThatTheSensorCouldNotBeStopped) {
  void* handle = open("LPE_P");
  platform.deactivateResult = -1;
  EXPECT_EQ(close(handle), -1);
  EXPECT_EQ(list, nullptr);
  EXPECT_EQ(gSessions.find(handle), nullptr);
  EXPECT_TRUE(sessionsOf("LPE_P").empty());
}

TEST_F(CloseSession, DoesNotStopASensorWithSessions) {
  void* one = open("LPE_P");
  open("LPE_P");
  events.clear();
  EXPECT_EQ(close(one), 1);
  EXPECT_EQ(events, Events{});
  EXPECT_TRUE(gIsActivated);
}

TEST_F(CloseSession, MergesTheRemainingOptionsThenRebuildsThenDeletes) {
  auto* a = openFake("STAP", "a");
  auto* b = openFake("STAP", "b");
  auto* c = openFake("STAP", "c");
  findSensor("STAP")->mergedOption = std::make_unique<fake::NamedOption>("old", events);
  EXPECT_EQ(close(a), 1);
  EXPECT_EQ(events, (Events{"b cloned", "b' merges b", "b' merges c", "old destroyed", "b' rendered", "b built",
                            "c built", "session a destroyed", "a destroyed"}));
  EXPECT_EQ(platform.takeLog(), (Log{fake::mergeLine(0, 2, *b), fake::mergeLine(1, 2, *c)}));
  ASSERT_NE(list, nullptr);
  EXPECT_EQ(list->properties[0].value, findSensor("STAP")->mergedOption.get());
  EXPECT_EQ(sessionsOf("STAP"), (std::vector<Session*>{b, c}));
  EXPECT_EQ(gSessions.find(a), nullptr);
  EXPECT_EQ(gSessions.find(b), b);
}

TEST_F(CloseSession, KeepsTheOthersInTheirOrder) {
  auto* a = openFake("STAP", "a");
  auto* b = openFake("STAP", "b");
  auto* c = openFake("STAP", "c");
  auto* d = openFake("STAP", "d");
  EXPECT_EQ(close(b), 1);
  EXPECT_EQ(sessionsOf("STAP"), (std::vector<Session*>{a, c, d}));
  EXPECT_EQ(close(d), 1);
  EXPECT_EQ(sessionsOf("STAP"), (std::vector<Session*>{a, c}));
  EXPECT_EQ(close(a), 1);
  EXPECT_EQ(sessionsOf("STAP"), (std::vector<Session*>{c}));
  EXPECT_EQ(close(c), 0);
}

TEST_F(CloseSession, TakesTheSessionOutWhereverItIsListed) {
  auto* a = openFake("STAP", "a");
  auto* b = openFake("STAP", "b");
  sessionsOf("STAP") = {a, b, a};
  EXPECT_EQ(close(a), 1);
  EXPECT_EQ(sessionsOf("STAP"), (std::vector<Session*>{b}));
}

TEST_F(CloseSession, SessionThatCanNotBeRebuiltIsAFailureWithAListAndTheSessionClosed) {
  auto* a = openFake("STAP", "a");
  auto* b = openFake("STAP", "b");
  openFake("STAP", "c");
  b->buildResult = -1;
  EXPECT_EQ(close(a), -1);
  EXPECT_NE(list, nullptr);
  EXPECT_EQ(Events(events.end() - 4, events.end()),
            (Events{"b built", "c built", "session a destroyed", "a destroyed"}));
  EXPECT_EQ(gSessions.find(a), nullptr);
}

TEST_F(CloseSession, ListThatCanNotBeMadeIsNoFailure) {
  auto* a = openFake("STAP", "a");
  openFake("STAP", "b")->namedOption().renders = false;
  EXPECT_EQ(close(a), 1);
  EXPECT_EQ(list, nullptr);
  EXPECT_EQ(Events(events.end() - 3, events.end()), (Events{"b built", "session a destroyed", "a destroyed"}));
}

TEST_F(CloseSession, GivesTheSettingsOfTheRemainingSessions) {
  void* one = open("STAP");
  void* two = open("STAP");
  ASSERT_EQ(setOption(one, R"({"classMask":1,"level":-3})"), 0);
  ASSERT_EQ(setOption(two, R"({"classMask":2,"level":4})"), 0);
  EXPECT_EQ(properties(), (Properties{{101, 3}, {102, -3}}));
  EXPECT_EQ(close(one), 1);
  EXPECT_EQ(properties(), (Properties{{101, 2}, {102, 4}}));
  EXPECT_EQ(close(two), 0);
  EXPECT_EQ(list, nullptr);
  EXPECT_EQ(static_cast<const OptionTapping&>(*findSensor("STAP")->mergedOption).classMask(), 2);
}

TEST_F(CloseSession, OnASensorMadeAnewStopsItThoughItNeverStarted) {
  void* handle = open("LPE_P");
  ctx_uninit();
  EXPECT_TRUE(gIsActivated);
  events.clear();
  EXPECT_EQ(close(handle), 0);
  EXPECT_EQ(events, (Events{"deactivate", "close"}));
  EXPECT_FALSE(gIsActivated);
}

TEST_F(CloseSession, OnASensorMadeAnewMergesTheSessionsOpenedSince) {
  auto* old = openFake("STAP", "old");
  ctx_uninit();
  auto* since = openFake("STAP", "since");
  EXPECT_EQ(close(old), 1);
  EXPECT_EQ(events, (Events{"since cloned", "since' merges since", "since' rendered", "since built",
                            "session old destroyed", "old destroyed"}));
  EXPECT_EQ(platform.takeLog(), (Log{fake::mergeLine(0, 1, *since)}));
}

TEST_F(CloseSession, WithoutMemoryForTheMergeTheSessionStaysOpen) {
  void* one = open("STAP");
  void* two = open("STAP");
  ASSERT_EQ(setOption(one, "{}"), 0);
  const Option* before = findSensor("STAP")->mergedOption.get();
  releaseList();
  platform.log.reserve(16);  // the fake is not to be what fails
  {
    const fake::FailingAllocation copy(1);
    EXPECT_EQ(ctx_close_session(one, &list), -1);
    EXPECT_TRUE(copy.happened());
  }
  EXPECT_EQ(list, nullptr);
  EXPECT_EQ(gSessions.find(one), one);
  EXPECT_EQ(sessionsOf("STAP"), (std::vector<Session*>{static_cast<Session*>(one), static_cast<Session*>(two)}));
  EXPECT_EQ(findSensor("STAP")->mergedOption.get(), before);
  EXPECT_EQ(close(one), 1);
}

class Uninit : public Api {};

TEST_F(Uninit, DoesNothingBeforeAnyOtherCallOrTwice) {
  ctx_uninit();
  EXPECT_FALSE(isInitialised());
  void* handle = open("STAP");
  ctx_uninit();
  ctx_uninit();
  EXPECT_EQ(gSessions.find(handle), handle);
}

TEST_F(Uninit, NextOpeningMakesAndStartsNewSensors) {
  open("LPE_P");
  ctx_uninit();
  gIsActivated = false;
  events.clear();
  EXPECT_NE(open("LPE_P"), nullptr);
  EXPECT_EQ(events, Events{"activate"});
  EXPECT_EQ(sessionsOf("LPE_P").size(), 1U);
  EXPECT_NE(open("STAP"), nullptr);
}

TEST_F(Uninit, LeavesTheAwareSessionOn) {
  open("LPE_P");
  events.clear();
  ctx_uninit();
  EXPECT_EQ(events, Events{});
  EXPECT_TRUE(gIsActivated);
}

TEST(OptionRelease, IsAlwaysASuccess) {
  EXPECT_EQ(ctx_option_release(nullptr), 0);
  EXPECT_EQ(ctx_option_release(Option::newOption(0)), 0);
  EXPECT_EQ(ctx_option_release(Option::newOption(3)), 0);
}

}  // namespace
}  // namespace senseloom
