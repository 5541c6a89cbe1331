#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "fake_session.h"
#include "registry/registry.h"
#include "senseloom.h"

// What the entry points do to sessions and options, and in which order, on the registry's own sensors. Each of these
// tests needs a fresh process, in which no sensor was ever made.
namespace senseloom {
namespace {

using Events = std::vector<std::string>;
using Log = std::vector<fake::LogLine>;

// Three fake sessions on one sensor, which has a merged option already.
class EntryPoints : public testing::Test {
 protected:
  EntryPoints() {
    _init_senseloom();
    for (const char* name : {"a", "b", "c"}) sessions.push_back(open("STAP", name));
    findSensor("STAP")->mergedOption = std::make_unique<fake::NamedOption>("old", events);
    events.clear();
  }
  ~EntryPoints() override {
    for (auto* session : sessions) {
      ctx_option_t* none = nullptr;
      if (gSessions.find(session) != nullptr) ctx_close_session(session, &none);
      ctx_option_release(none);
    }
    ctx_option_release(list);
    ctx_uninit();
  }

  fake::NamedSession* open(const char* sensor, const char* name) {
    auto* session = new fake::NamedSession(sensor, name, events);
    gSessions.reserveOne();
    gSessions.insert(session);
    findSensor(sensor)->sessions.push_back(session);
    return session;
  }
  const void* merged() const { return findSensor("STAP")->mergedOption.get(); }

  Events events;
  std::vector<fake::NamedSession*> sessions;
  ctx_option_t* list = nullptr;
};

TEST_F(EntryPoints, DispatchReachesTheSessionOfTheHandleAloneAndReturnsItsResult) {
  char data[4] = {};
  void* out = this;
  int outLen = -77;
  for (const int result : {0, -1, 5, -9}) {
    sessions[1]->processResult = result;
    EXPECT_EQ(ctx_dispatch_data(sessions[1], data, 4, &out, &outLen), result);
    EXPECT_EQ(out, this);
    EXPECT_EQ(outLen, -77);
  }
  sessions[1]->processResult = 1;
  events.clear();
  EXPECT_EQ(ctx_dispatch_data(sessions[1], data, 0, &out, &outLen), 1);
  EXPECT_EQ(events, Events{"b takes 0 bytes"});
}

TEST_F(EntryPoints, SetOptionParsesThenMergesACopyThenRebuilds) {
  EXPECT_EQ(ctx_set_option(sessions[1], -1, "text", &list), 0);
  EXPECT_EQ(events, (Events{"b parses text", "b cloned", "b' merges a", "b' merges b", "b' merges c", "old destroyed",
                            "b' rendered", "a built", "b built", "c built"}));
  EXPECT_EQ(fake::platform().takeLog(), (Log{fake::mergeLine(0, 3, *sessions[0]), fake::mergeLine(1, 3, *sessions[1]),
                                             fake::mergeLine(2, 3, *sessions[2])}));
  ASSERT_NE(list, nullptr);
  EXPECT_EQ(list->properties[0].value, merged());
}

TEST_F(EntryPoints, AnyResultOfAParseButZeroIsARefusal) {
  const void* before = merged();
  for (const int result : {-1, 1}) {
    events.clear();
    sessions[0]->own.parseResult = result;
    EXPECT_EQ(ctx_set_option(sessions[0], 0, "text", &list), -1);
    EXPECT_EQ(list, nullptr);
    EXPECT_EQ(events, Events{"a parses text"});
    EXPECT_EQ(merged(), before);
  }
}

TEST_F(EntryPoints, ListThatCannotBeMadeFailsSetOptionBeforeAnythingIsRebuilt) {
  sessions[0]->own.renders = false;
  EXPECT_EQ(ctx_set_option(sessions[0], 0, "text", &list), -1);
  EXPECT_EQ(list, nullptr);
  EXPECT_EQ(events.back(), "a' rendered");
}

TEST_F(EntryPoints, SessionThatCannotBeRebuiltFailsSetOptionWithAList) {
  sessions[0]->buildResult = -1;
  sessions[1]->buildResult = 1;  // counts as success
  EXPECT_EQ(ctx_set_option(sessions[2], 0, "text", &list), -1);
  ASSERT_NE(list, nullptr);
  EXPECT_EQ(list->properties[0].value, merged());
  EXPECT_EQ(Events(events.end() - 3, events.end()), (Events{"a built", "b built", "c built"}));
  ctx_option_release(list);
  sessions[0]->buildResult = 0;
  EXPECT_EQ(ctx_set_option(sessions[2], 0, "text", &list), 0);
}

TEST_F(EntryPoints, CloseMergesTheRemainingOptionsThenRebuildsThenDeletes) {
  EXPECT_EQ(ctx_close_session(sessions[0], &list), 1);
  EXPECT_EQ(events, (Events{"b cloned", "b' merges b", "b' merges c", "old destroyed", "b' rendered", "b built",
                            "c built", "session a destroyed", "a destroyed"}));
  EXPECT_EQ(fake::platform().takeLog(),
            (Log{fake::mergeLine(0, 2, *sessions[1]), fake::mergeLine(1, 2, *sessions[2])}));
}

TEST_F(EntryPoints, ListThatCannotBeMadeFailsNoClose) {
  sessions[1]->own.renders = false;
  EXPECT_EQ(ctx_close_session(sessions[0], &list), 1);
  EXPECT_EQ(list, nullptr);
}

TEST_F(EntryPoints, SessionThatCannotBeRebuiltFailsACloseThatGivesAListAndCloses) {
  sessions[1]->buildResult = -1;
  EXPECT_EQ(ctx_close_session(sessions[0], &list), -1);
  EXPECT_NE(list, nullptr);
  EXPECT_EQ(gSessions.find(sessions[0]), nullptr);
}

TEST_F(EntryPoints, SensorIsStoppedAfterItsLastSessionWasDeleted) {
  ASSERT_TRUE(audio_hal_activate());
  auto& platformCalls = fake::platform().calls;
  platformCalls.clear();
  auto* session = new fake::NamedSession("LPE_P", "d", platformCalls);
  gSessions.reserveOne();
  gSessions.insert(session);
  findSensor("LPE_P")->sessions.push_back(session);
  EXPECT_EQ(ctx_close_session(session, &list), 0);
  EXPECT_EQ(platformCalls, (Events{"session d destroyed", "d destroyed", "deactivate", "close"}));
}

TEST_F(EntryPoints, SessionWhoseSensorWasDeletedNegotiatesWithNobody) {
  ctx_uninit();
  events.clear();
  EXPECT_EQ(ctx_set_option(sessions[0], 0, "text", &list), 0);
  EXPECT_EQ(events, (Events{"a parses text", "a cloned", "a' rendered"}));
}

}  // namespace
}  // namespace senseloom
