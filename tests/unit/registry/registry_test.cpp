#include "registry/registry.h"

#include <gtest/gtest.h>

#include <memory>
#include <new>
#include <set>
#include <string>

#include "fake_option.h"
#include "fake_platform.h"
#include "fake_session.h"
#include "library_memory.h"

// Each of these tests needs a fresh process, in which no sensor was ever made.
namespace senseloom {
namespace {

using Events = std::vector<std::string>;

// In the order in which they are made and deleted.
const char* const kNames[] = {"PHYAC", "STAP",  "GSFLK", "SHAKI", "ISACT", "SCOUN",
                              "GSPX",  "DTWGS", "GSETH", "LPE_P", "PDR",   "LIFT"};

void expectNoSensors() {
  for (const char* name : kNames) EXPECT_EQ(findSensor(name), nullptr) << name;
}

class Registry : public testing::Test {
 protected:
  void TearDown() override { ctx_uninit(); }
};

TEST_F(Registry, IsEmptyUntilItIsInitialised) {
  expectNoSensors();
  ctx_uninit();
  expectNoSensors();
}

TEST_F(Registry, HasTwelveSensorsByName) {
  _init_senseloom();
  std::set<ContextSensor*> sensors;
  for (const char* name : kNames) {
    ContextSensor* sensor = findSensor(name);
    ASSERT_NE(sensor, nullptr) << name;
    EXPECT_STREQ(std::unique_ptr<Session>(sensor->createSession())->name, name);
    EXPECT_EQ(sensor->mergedOption, nullptr);
    EXPECT_TRUE(sensor->sessions.empty());
    sensors.insert(sensor);
  }
  EXPECT_EQ(sensors.size(), 12U);
}

TEST_F(Registry, IsInitialisedOnce) {
  _init_senseloom();
  ContextSensor* sensors[12];
  for (size_t i = 0; i < 12; ++i) sensors[i] = findSensor(kNames[i]);
  const memory::AllocationCount allocations;
  _init_senseloom();
  EXPECT_EQ(allocations.made(), 0U);
  for (size_t i = 0; i < 12; ++i) EXPECT_EQ(findSensor(kNames[i]), sensors[i]) << kNames[i];
}

TEST_F(Registry, SensorsAreDeletedInTheirOrder) {
  _init_senseloom();
  Events events;
  Events expected;
  for (const char* name : kNames) {
    findSensor(name)->mergedOption = std::make_unique<fake::NamedOption>(name, events);
    expected.push_back(std::string(name) + " destroyed");
  }
  ctx_uninit();
  EXPECT_EQ(events, expected);
  ctx_uninit();
  EXPECT_EQ(events, expected) << "there is nothing left to delete";
}

TEST_F(Registry, KeepsThePointersToDeletedSensors) {
  _init_senseloom();
  ContextSensor* sensors[12];
  for (size_t i = 0; i < 12; ++i) sensors[i] = findSensor(kNames[i]);
  ctx_uninit();
  for (size_t i = 0; i < 12; ++i) EXPECT_EQ(findSensor(kNames[i]), sensors[i]) << kNames[i];
}

TEST_F(Registry, HasNewSensorsAfterTheNextInitialisation) {
  _init_senseloom();
  Events events;
  fake::NamedSession session("STAP", "a", events);
  for (const char* name : kNames) {
    findSensor(name)->sessions.push_back(&session);
    findSensor(name)->mergedOption = std::make_unique<fake::NamedOption>(name, events);
  }
  ctx_uninit();
  _init_senseloom();
  for (const char* name : kNames) {
    EXPECT_TRUE(findSensor(name)->sessions.empty()) << name;
    EXPECT_EQ(findSensor(name)->mergedOption, nullptr) << name;
  }
}

TEST_F(Registry, UninitialisingNeitherTouchesSessionsNorStopsSensors) {
  _init_senseloom();
  ASSERT_TRUE(findSensor("LPE_P")->onStart());
  fake::platform().calls.clear();
  auto session = std::make_unique<fake::NamedSession>("LPE_P", "a", fake::platform().calls);
  findSensor("LPE_P")->sessions.push_back(session.get());
  gSessions.reserveOne();
  gSessions.insert(session.get());
  ctx_uninit();
  EXPECT_EQ(fake::platform().calls, Events{});
  EXPECT_TRUE(gIsActivated);
  EXPECT_EQ(gSessions.find(session.get()), session.get());
  gSessions.erase(session.get());
}

TEST_F(Registry, MakesAllSensorsOrNone) {
  size_t failures = 0;
  for (;; ++failures) {
    const memory::FailingAllocation next(failures + 1);
    try {
      _init_senseloom();
      break;
    } catch (const std::bad_alloc&) {
    }
    expectNoSensors();
    EXPECT_FALSE(gInited);
  }
  EXPECT_EQ(failures, 12U);
  for (const char* name : kNames) EXPECT_NE(findSensor(name), nullptr) << name;
}

}  // namespace
}  // namespace senseloom
