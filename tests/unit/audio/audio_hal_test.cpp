#include <gtest/gtest.h>

#include <array>
#include <cstdio>
#include <ostream>
#include <set>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

#include "fake_platform.h"
#include "senseloom.h"

namespace {

// The states of the bridge.
enum class State { closed, open, active };
enum class Call { init, activate, deactivate };
// What the platform answers, should it be asked.
enum class Answer {
  moduleMissing,
  openError,
  nullDevice,
  wrongVersion,
  activationRefused,
  deactivationRefused,
  good,
};

using Answers = std::vector<Answer>;
using Log = std::vector<fake::LogLine>;
using Calls = std::vector<std::string>;

const Answers kAny = {Answer::moduleMissing,     Answer::openError,           Answer::nullDevice, Answer::wrongVersion,
                      Answer::activationRefused, Answer::deactivationRefused, Answer::good};
// No failure to open the device.
const Answers kOpens = {Answer::activationRefused, Answer::deactivationRefused, Answer::good};

Answers anyBut(Answer answer) {
  Answers answers = kAny;
  std::erase(answers, answer);
  return answers;
}

fake::LogLine debug(const std::string& text) {
  return {3, "aware_audio", text};
}
fake::LogLine error(const std::string& text) {
  return {6, "aware_audio", text};
}

Log operator+(Log log, const Log& more) {
  log.insert(log.end(), more.begin(), more.end());
  return log;
}

const Log kMissing = {debug("bool audio_hal_init() load audio hw module aware.primary (No such file or directory)")};
const Log kLoaded = {debug("bool audio_hal_init() load audio hw module aware.primary (Success)")};
const Log kOpenError = kLoaded + Log{debug("device open result -19\n")};
const Log kNullDevice = kLoaded + Log{debug("device open result 0\n")};
const Log kWrongVersion = kNullDevice + Log{debug("device version 256\n")};
const Log kOpened = kNullDevice + Log{debug("device version 512\n")};
const Log kOpenBefore = {debug("It is already inited!")};
const Log kInitFailed = {error("init audio hal failed")};
const Log kActivated = {debug("activated aware successful...\n")};
const Log kActivationFailed = {error("activated aware failed\n")};
const Log kActiveBefore = {debug("already activated, return")};
const Log kDeactivated = {debug("deactivated aware session successful... \n")};
const Log kStaysActive = {error("deactivated aware session failed \n")};
const Log kInactiveBefore = {debug("already deactivated, return")};

Log activating() {
  std::array<char, 64> text;
  std::snprintf(text.data(), text.size(), "activating aware... %p\n", fake::platform().deviceAddress());
  return {debug(text.data())};
}

const std::string kGet = "get aware.primary";
const std::string kOpen = "open aware_hw_if";
const Calls kClosing = {"deactivate", "close"};
const std::string kSaid = "deactivating aware session...\n";

struct Row {
  State before;
  Call call;
  Answers answers;  // which all lead to the rest
  bool result;
  Log log;
  Calls calls;
  State after;
  std::string written = "";  // to standard output
};

std::vector<Row> rows() {
  using enum State;
  using enum Call;
  using enum Answer;
  const Log activated = activating() + kActivated;
  const Log refused = activating() + kActivationFailed;
  const Calls opening = {kGet, kOpen};
  const Calls activation = {kGet, kOpen, "activate"};
  return {
      {closed, init, {moduleMissing}, false, kMissing, {kGet}, closed},
      {closed, init, {openError}, false, kOpenError, opening, closed},
      {closed, init, {nullDevice}, false, kNullDevice, opening, closed},
      {closed, init, {wrongVersion}, false, kWrongVersion, opening, open},
      {closed, init, kOpens, true, kOpened, opening, open},

      {closed, activate, {moduleMissing}, false, kMissing + kInitFailed, {kGet}, closed},
      {closed, activate, {openError}, false, kOpenError + kInitFailed, opening, closed},
      {closed, activate, {nullDevice}, false, kNullDevice + kInitFailed, opening, closed},
      {closed, activate, {wrongVersion}, false, kWrongVersion + kInitFailed, opening, open},
      {closed, activate, {activationRefused}, false, kOpened + refused, activation, open},
      {closed, activate, {deactivationRefused, good}, true, kOpened + activated, activation, active},

      {closed, deactivate, {moduleMissing}, false, kMissing + kInitFailed, {kGet}, closed},
      {closed, deactivate, {openError}, false, kOpenError + kInitFailed, opening, closed},
      {closed, deactivate, {nullDevice}, false, kNullDevice + kInitFailed, opening, closed},
      {closed, deactivate, {wrongVersion}, false, kWrongVersion + kInitFailed, opening, open},
      {closed, deactivate, kOpens, true, kOpened + kInactiveBefore, opening, open},

      {open, init, kAny, true, kOpenBefore, {}, open},
      {open, activate, {activationRefused}, false, kOpenBefore + refused, {"activate"}, open},
      {open, activate, anyBut(activationRefused), true, kOpenBefore + activated, {"activate"}, active},
      {open, deactivate, kAny, true, kOpenBefore + kInactiveBefore, {}, open},

      {active, init, kAny, true, kOpenBefore, {}, active},
      {active, activate, kAny, true, kOpenBefore + kActiveBefore, {}, active},
      {active, deactivate, {deactivationRefused}, false, kOpenBefore + kStaysActive, {"deactivate"}, active, kSaid},
      {active, deactivate, anyBut(deactivationRefused), true, kOpenBefore + kDeactivated, kClosing, closed, kSaid},
  };
}

std::string nameOf(State state) {
  switch (state) {
    case State::closed:
      return "Closed";
    case State::open:
      return "Open";
    case State::active:
      break;
  }
  return "Active";
}

std::string nameOf(Call call) {
  switch (call) {
    case Call::init:
      return "Init";
    case Call::activate:
      return "Activate";
    case Call::deactivate:
      break;
  }
  return "Deactivate";
}

std::string nameOf(Answer answer) {
  switch (answer) {
    case Answer::moduleMissing:
      return "ModuleMissing";
    case Answer::openError:
      return "OpenError";
    case Answer::nullDevice:
      return "NullDevice";
    case Answer::wrongVersion:
      return "WrongVersion";
    case Answer::activationRefused:
      return "ActivationRefused";
    case Answer::deactivationRefused:
      return "DeactivationRefused";
    case Answer::good:
      break;
  }
  return "Good";
}

// "OpenActivateOnGood", and for several answers "OpenActivateOnOpenErrorAnd5More".
std::string nameOf(const Row& row) {
  std::string name = nameOf(row.before) + nameOf(row.call) + "On" + nameOf(row.answers.front());
  return row.answers.size() == 1 ? name : name + "And" + std::to_string(row.answers.size() - 1) + "More";
}

void PrintTo(const Row& row, std::ostream* out) {
  *out << nameOf(row);
}
void PrintTo(State state, std::ostream* out) {
  *out << nameOf(state);
}

bool make(Call call) {
  switch (call) {
    case Call::init:
      return audio_hal_init();
    case Call::activate:
      return audio_hal_activate();
    case Call::deactivate:
      break;
  }
  return audio_hal_deactivate();
}

void set(Answer answer) {
  auto& platform = fake::platform();
  switch (answer) {
    case Answer::moduleMissing:
      platform.getResult = -2;
      break;
    case Answer::openError:
      platform.openResult = -19;
      break;
    case Answer::nullDevice:
      platform.openGivesDevice = false;
      break;
    case Answer::wrongVersion:
      platform.deviceVersion = 0x100;
      break;
    case Answer::activationRefused:
      platform.activateResult = -5;
      break;
    case Answer::deactivationRefused:
      platform.deactivateResult = -5;
      break;
    case Answer::good:
      break;
  }
}

State state() {
  if (device == nullptr) {
    EXPECT_FALSE(gIsActivated);
    return State::closed;
  }
  EXPECT_EQ(static_cast<const void*>(device), fake::platform().deviceAddress());
  return gIsActivated ? State::active : State::open;
}

void close() {
  device = nullptr;
  gIsActivated = false;
  fake::platform() = {};
}

// Brings the bridge from closed to another state.
void bringTo(State wanted) {
  close();
  if (wanted == State::open) audio_hal_init();
  if (wanted == State::active) audio_hal_activate();
  ASSERT_EQ(state(), wanted);
  fake::platform() = {};
}

class AudioBridge : public testing::Test {
 protected:
  ~AudioBridge() override { close(); }

  Log takeLog() { return fake::platform().takeLog(); }
  Calls takeCalls() { return std::exchange(fake::platform().calls, {}); }
};

class AudioBridgeCase : public AudioBridge, public testing::WithParamInterface<Row> {};

INSTANTIATE_TEST_SUITE_P(Case, AudioBridgeCase, testing::ValuesIn(rows()),
                         [](const auto& instance) { return nameOf(instance.param); });

TEST(AudioBridgeStates, ClosedIsTheFirst) {
  EXPECT_EQ(state(), State::closed);
}

TEST(AudioBridgeStates, EachCallIsTriedInEachWithEachAnswer) {
  std::multiset<std::tuple<State, Call, Answer>> tried;
  for (const Row& row : rows()) {
    for (const Answer answer : row.answers) tried.emplace(row.before, row.call, answer);
  }
  EXPECT_EQ(tried.size(), 3U * 3U * kAny.size());
  EXPECT_EQ((std::set(tried.begin(), tried.end()).size()), tried.size());
}

TEST_P(AudioBridgeCase, ResultMessagesCallsAndStateAreAsExpected) {
  const Row& row = GetParam();
  for (const Answer answer : row.answers) {
    SCOPED_TRACE(nameOf(answer));
    bringTo(row.before);
    set(answer);
    testing::internal::CaptureStdout();
    const bool result = make(row.call);
    EXPECT_EQ(testing::internal::GetCapturedStdout(), row.written);
    EXPECT_EQ(result, row.result);
    EXPECT_EQ(takeLog(), row.log);
    EXPECT_EQ(takeCalls(), row.calls);
    EXPECT_EQ(state(), row.after);
  }
}

TEST_F(AudioBridge, ActivationPassesTheParameterBlock) {
  const std::array<uint8_t, 48> expected = {
      128,  0,    0,    0,     // 128
      12,   0,    20,   0,     // 12, 20
      24,   0,    0,    0,     // 24 and two bytes that mean nothing
      76,   0,    0,    0,     // 76
      0xfe, 0xff, 0xff, 0xff,  // -2
      0xff, 0xff, 0xff, 0xff,  // -1
      21,   0,    0,    0,     // 21
      0xcc, 0x3c, 0,    0,     // 15564
      0x70, 0x7d, 0,    0,     // 32112
      0x99, 0x19, 0,    0,     // 6553
      0xcc, 0x0c, 0,    0,     // 3276
      64,   0,    4,    0,     // 64, 4
  };
  for (int time = 1; time <= 2; ++time) {
    fake::platform().activationBlock.fill(0x5a);
    ASSERT_TRUE(audio_hal_activate());
    auto block = fake::platform().activationBlock;
    block[10] = block[11] = 0;
    EXPECT_EQ(block, expected) << "time " << time;
    ASSERT_TRUE(audio_hal_deactivate());
  }
}

TEST_F(AudioBridge, SecondActivationDoesNotReachTheDevice) {
  EXPECT_TRUE(audio_hal_activate());
  takeLog();
  takeCalls();
  EXPECT_TRUE(audio_hal_activate());
  EXPECT_EQ(takeLog(), kOpenBefore + kActiveBefore);
  EXPECT_TRUE(takeCalls().empty());
}

TEST_F(AudioBridge, DeviceOfAWrongVersionFailsOnlyTheCallThatOpensIt) {
  for (const Call first : {Call::init, Call::activate, Call::deactivate}) {
    close();
    set(Answer::wrongVersion);
    EXPECT_FALSE(make(first));
    takeLog();
    takeCalls();
    EXPECT_TRUE(audio_hal_activate()) << nameOf(first);
    EXPECT_EQ(takeLog(), kOpenBefore + activating() + kActivated);
    EXPECT_EQ(takeCalls(), Calls{"activate"});
  }
}

TEST_F(AudioBridge, EveryVersionButTwoIsWrong) {
  for (const auto& [version, logged] : {std::pair{0U, "0"}, {0x1ffU, "511"}, {0x201U, "513"}, {0xffffffffU, "-1"}}) {
    close();
    fake::platform().deviceVersion = version;
    EXPECT_FALSE(audio_hal_init()) << version;
    EXPECT_EQ(takeLog(), kNullDevice + Log{debug(std::string("device version ") + logged + "\n")});
    EXPECT_EQ(state(), State::open);
  }
}

TEST_F(AudioBridge, MissingModuleFailsEveryCallWithTheTextOfTheError) {
  for (const auto& [result, text] : {std::pair{-2, "No such file or directory"},
                                     {-13, "Permission denied"},
                                     {-22, "Invalid argument"},
                                     {1, "Unknown error -1"}}) {
    for (const Call call : {Call::init, Call::activate, Call::deactivate, Call::activate}) {
      fake::platform().getResult = result;
      EXPECT_FALSE(make(call));
      const Log loading = {
          debug(std::string("bool audio_hal_init() load audio hw module aware.primary (") + text + ")")};
      EXPECT_EQ(takeLog(), call == Call::init ? loading : loading + kInitFailed);
      EXPECT_EQ(takeCalls(), Calls{kGet});
      EXPECT_EQ(state(), State::closed);
    }
  }
}

TEST_F(AudioBridge, AnyResultOfTheDeviceButZeroIsAFailure) {
  for (const int result : {-1, 1, 256}) {
    close();
    fake::platform().openResult = result;
    EXPECT_FALSE(audio_hal_init()) << result;
    fake::platform().openResult = 0;
    fake::platform().activateResult = result;
    EXPECT_FALSE(audio_hal_activate()) << result;
    fake::platform().activateResult = 0;
    EXPECT_TRUE(audio_hal_activate());
    fake::platform().deactivateResult = result;
    EXPECT_FALSE(audio_hal_deactivate()) << result;
    EXPECT_EQ(state(), State::active);
  }
}

TEST_F(AudioBridge, RefusedDeactivationIsTriedAgainByTheNext) {
  bringTo(State::active);
  set(Answer::deactivationRefused);
  EXPECT_FALSE(audio_hal_deactivate());
  EXPECT_FALSE(audio_hal_deactivate());
  fake::platform().deactivateResult = 0;
  EXPECT_TRUE(audio_hal_deactivate());
  EXPECT_EQ(takeCalls(), (Calls{"deactivate", "deactivate", "deactivate", "close"}));
  EXPECT_EQ(state(), State::closed);
}

TEST_F(AudioBridge, ActivationAfterADeactivationOpensTheDeviceAnew) {
  EXPECT_TRUE(audio_hal_activate());
  EXPECT_TRUE(audio_hal_deactivate());
  EXPECT_TRUE(audio_hal_activate());
  EXPECT_EQ(takeCalls(), (Calls{kGet, kOpen, "activate", "deactivate", "close", kGet, kOpen, "activate"}));
  EXPECT_EQ(state(), State::active);
}

TEST_F(AudioBridge, SecondDeactivationOpensTheDeviceAndLeavesItOpen) {
  bringTo(State::active);
  EXPECT_TRUE(audio_hal_deactivate());
  takeCalls();
  EXPECT_TRUE(audio_hal_deactivate());
  EXPECT_EQ(takeCalls(), (Calls{kGet, kOpen}));
  EXPECT_EQ(state(), State::open);
}

}  // namespace
