#include "registry/negotiation.h"

#include <gtest/gtest.h>

#include "fake_option.h"
#include "fake_session.h"

namespace senseloom {
namespace {

using Events = std::vector<std::string>;
using Log = std::vector<fake::LogLine>;

class FakeSensor final : public ContextSensor {
 public:
  Session* createSession() const override { return nullptr; }
};

class Negotiation : public testing::Test {
 protected:
  void SetUp() override {
    for (auto& session : sessions) sensor.sessions.push_back(&session);
  }
  void TearDown() override {
    ctx_option_release(list);
    fake::platform() = {};
  }

  std::unique_ptr<fake::NamedOption> option(const char* name) {
    return std::make_unique<fake::NamedOption>(name, events);
  }

  Events events;
  fake::NamedSession sessions[3] = {
      {"GSFLK", "a", events},
      {"GSFLK", "b", events},
      {"GSFLK", "c", events},
  };
  FakeSensor sensor;
  ctx_option_t* list = nullptr;
};

TEST_F(Negotiation, MergesAllOptionsInOpeningOrderThenReplacesAndRenders) {
  sensor.mergedOption = option("old");
  auto merged = option("new");
  Option* const isNew = merged.get();
  negotiate(sensor, std::move(merged), &list);
  EXPECT_EQ(events, (Events{"new merges a", "new merges b", "new merges c", "old destroyed", "new rendered"}));
  EXPECT_EQ(sensor.mergedOption.get(), isNew);
  ASSERT_NE(list, nullptr);
  EXPECT_EQ(list->properties[0].value, isNew);
}

TEST_F(Negotiation, WithoutSessionsMergesNothing) {
  sensor.sessions.clear();
  negotiate(sensor, option("new"), &list);
  EXPECT_EQ(events, Events{"new rendered"});
  EXPECT_EQ(fake::platform().takeLog(), Log{});
}

TEST_F(Negotiation, KeepsAMergedOptionThatCannotBeRendered) {
  auto merged = option("new");
  Option* const isNew = merged.get();
  merged->renders = false;
  negotiate(sensor, std::move(merged), &list);
  EXPECT_EQ(list, nullptr);
  EXPECT_EQ(sensor.mergedOption.get(), isNew);
}

TEST_F(Negotiation, RebuildsNothing) {
  negotiate(sensor, option("new"), &list);
  for (const std::string& event : events) EXPECT_EQ(event.find("built"), std::string::npos) << event;
}

TEST_F(Negotiation, EverySessionIsRebuiltInOpeningOrder) {
  sessions[1].buildResult = 1;
  EXPECT_TRUE(rebuildSessions(sensor));
  EXPECT_EQ(events, (Events{"a built", "b built", "c built"}));
}

TEST_F(Negotiation, EverySessionIsRebuiltEvenAfterAFailure) {
  for (auto& failing : sessions) {
    for (const int result : {-1, -2}) {
      events.clear();
      failing.buildResult = result;
      EXPECT_FALSE(rebuildSessions(sensor)) << failing.label;
      EXPECT_EQ(events, (Events{"a built", "b built", "c built"}));
    }
    failing.buildResult = 0;
  }
}

TEST_F(Negotiation, WithoutSessionsNothingFailsToBeRebuilt) {
  sensor.sessions.clear();
  EXPECT_TRUE(rebuildSessions(sensor));
}

}  // namespace
}  // namespace senseloom
