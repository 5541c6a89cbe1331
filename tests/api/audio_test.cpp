#include "client.h"

// Audio classification and the bridge to the platform's aware audio session.
namespace api {
namespace {

using Calls = std::vector<std::string>;

LogLine audio(int priority, std::string text) {
  return {priority, "aware_audio", std::move(text)};
}

const Log kInited = {audio(kDebug, "It is already inited!")};
const Log kInitFailed = {audio(kError, "init audio hal failed")};

Log loaded(const std::string& error) {
  return {audio(kDebug, "bool audio_hal_init() load audio hw module aware.primary (" + error + ")")};
}
const Log kOpened =
    loaded("Success") + Log{audio(kDebug, "device open result 0\n"), audio(kDebug, "device version 512\n")};

Log activating() {
  return {audio(kDebug, "activating aware... " + addressText(platform().deviceAddress()) + "\n")};
}
const Log kActivated = {audio(kDebug, "activated aware successful...\n")};
const Log kDeactivated = {audio(kDebug, "deactivated aware session successful... \n")};

const Calls kOpen = {"get aware.primary", "open aware_hw_if"};

enum class State { closed, open, active };

State state() {
  if (device == nullptr) {
    EXPECT_FALSE(gIsActivated);
    return State::closed;
  }
  EXPECT_EQ(static_cast<const void*>(device), platform().deviceAddress());
  return gIsActivated ? State::active : State::open;
}

void PrintTo(State shown, std::ostream* out) {
  *out << (shown == State::closed ? "closed" : shown == State::open ? "open" : "active");
}

// All that a call does.
struct Effect {
  bool result;
  State state;
  Calls calls;
  Log log;
  std::string output;
  bool operator==(const Effect&) const = default;
};

void PrintTo(const Effect& effect, std::ostream* out) {
  *out << ::testing::PrintToString(effect.result) << ' ' << ::testing::PrintToString(effect.state) << ' '
       << ::testing::PrintToString(effect.calls) << ' ' << ::testing::PrintToString(effect.log) << ' ' << effect.output;
}

template <class Call>
Effect effectOf(Call call) {
  platform().calls.clear();
  platform().takeLog();
  ::testing::internal::CaptureStdout();
  const bool result = call();
  std::fflush(stdout);
  return {result, state(), platform().calls, platform().takeLog(), ::testing::internal::GetCapturedStdout()};
}

const std::string kPuts = "deactivating aware session...\n";

TEST(AudioBridge, InitOpensTheDeviceOnce) {
  EXPECT_EQ(effectOf(audio_hal_init), (Effect{true, State::open, kOpen, kOpened, ""}));
  EXPECT_EQ(effectOf(audio_hal_init), (Effect{true, State::open, {}, kInited, ""}));
}

TEST(AudioBridge, ActivationSwitchesTheSessionOnOnce) {
  EXPECT_EQ(effectOf(audio_hal_activate),
            (Effect{true, State::active, kOpen + Calls{"activate"}, kOpened + activating() + kActivated, ""}));
  EXPECT_EQ(effectOf(audio_hal_activate),
            (Effect{true, State::active, {}, kInited + Log{audio(kDebug, "already activated, return")}, ""}));
}

TEST(AudioBridge, ActivationPassesItsParameters) {
  EXPECT_TRUE(audio_hal_activate());
  auto block = platform().activationBlock;
  block[10] = block[11] = 0;  // padding
  EXPECT_EQ(block, (std::array<uint8_t, 48>{0x80, 0,    0, 0, 12,   0,    20,   0,    24,   0,    0,    0,
                                            76,   0,    0, 0, 0xFE, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF,
                                            21,   0,    0, 0, 0xCC, 0x3C, 0,    0,    0x70, 0x7D, 0,    0,
                                            0x99, 0x19, 0, 0, 0xCC, 0x0C, 0,    0,    64,   0,    4,    0}));
}

TEST(AudioBridge, DeactivationSwitchesTheSessionOffAndClosesTheDevice) {
  EXPECT_TRUE(audio_hal_activate());
  EXPECT_EQ(effectOf(audio_hal_deactivate),
            (Effect{true, State::closed, {"deactivate", "close"}, kInited + kDeactivated, kPuts}));
  EXPECT_EQ(effectOf(audio_hal_activate),
            (Effect{true, State::active, kOpen + Calls{"activate"}, kOpened + activating() + kActivated, ""}));
}

TEST(AudioBridge, DeactivationWithoutASessionOpensTheDeviceAndLeavesItOpen) {
  const Log already = {audio(kDebug, "already deactivated, return")};
  EXPECT_EQ(effectOf(audio_hal_deactivate), (Effect{true, State::open, kOpen, kOpened + already, ""}));
  EXPECT_EQ(effectOf(audio_hal_deactivate), (Effect{true, State::open, {}, kInited + already, ""}));
}

TEST(AudioBridge, FailedActivationLeavesTheDeviceOpen) {
  const Log failed = {audio(kError, "activated aware failed\n")};
  platform().activateResult = 1;
  EXPECT_EQ(effectOf(audio_hal_activate),
            (Effect{false, State::open, kOpen + Calls{"activate"}, kOpened + activating() + failed, ""}));
  EXPECT_EQ(effectOf(audio_hal_activate),
            (Effect{false, State::open, {"activate"}, kInited + activating() + failed, ""}));
  platform().activateResult = 0;
  EXPECT_EQ(effectOf(audio_hal_activate),
            (Effect{true, State::active, {"activate"}, kInited + activating() + kActivated, ""}));
}

TEST(AudioBridge, FailedDeactivationLeavesTheSessionOn) {
  const Log failed = {audio(kError, "deactivated aware session failed \n")};
  EXPECT_TRUE(audio_hal_activate());
  platform().deactivateResult = -1;
  for (int attempt = 0; attempt < 2; ++attempt) {
    EXPECT_EQ(effectOf(audio_hal_deactivate), (Effect{false, State::active, {"deactivate"}, kInited + failed, kPuts}));
  }
  platform().deactivateResult = 0;
  EXPECT_EQ(effectOf(audio_hal_deactivate),
            (Effect{true, State::closed, {"deactivate", "close"}, kInited + kDeactivated, kPuts}));
}

TEST(AudioBridge, EveryCallFailsWithoutTheModuleOrItsDevice) {
  const struct {
    const char* name;
    void (*prepare)();
    Calls calls;
    Log log;
  } failures[] = {
      {"no module", [] { platform().getResult = -2; }, {"get aware.primary"}, loaded("No such file or directory")},
      {"no permission", [] { platform().getResult = -13; }, {"get aware.primary"}, loaded("Permission denied")},
      {"device does not open", [] { platform().openResult = -22; }, kOpen,
       loaded("Success") + Log{audio(kDebug, "device open result -22\n")}},
      {"no device", [] { platform().openGivesDevice = false; }, kOpen,
       loaded("Success") + Log{audio(kDebug, "device open result 0\n")}},
  };
  for (const auto& [name, prepare, calls, log] : failures) {
    SCOPED_TRACE(name);
    platform() = {};
    prepare();
    EXPECT_EQ(effectOf(audio_hal_init), (Effect{false, State::closed, calls, log, ""}));
    EXPECT_EQ(effectOf(audio_hal_activate), (Effect{false, State::closed, calls, log + kInitFailed, ""}));
    EXPECT_EQ(effectOf(audio_hal_deactivate), (Effect{false, State::closed, calls, log + kInitFailed, ""}));
    EXPECT_EQ(effectOf([] { return ctx_open_session("LPE_P") != nullptr; }),
              (Effect{false, State::closed, calls, log + kInitFailed, ""}));
  }
}

TEST(AudioBridge, WrongVersionFailsOnlyTheCallThatOpensTheDevice) {
  platform().deviceVersion = 0x100;
  const Log opened =
      loaded("Success") + Log{audio(kDebug, "device open result 0\n"), audio(kDebug, "device version 256\n")};
  EXPECT_EQ(effectOf([] { return ctx_open_session("LPE_P") != nullptr; }),
            (Effect{false, State::open, kOpen, opened + kInitFailed, ""}));
  EXPECT_EQ(effectOf([] { return ctx_open_session("LPE_P") != nullptr; }),
            (Effect{true, State::active, {"activate"}, kInited + activating() + kActivated, ""}));
  EXPECT_TRUE(audio_hal_deactivate());
  EXPECT_EQ(effectOf(audio_hal_init), (Effect{false, State::open, kOpen, opened, ""}));
}

TEST(AudioClassification, FollowsItsSessions) {
  void* first = nullptr;
  void* second = nullptr;
  EXPECT_EQ(effectOf([&] { return (first = ctx_open_session("LPE_P")) != nullptr; }),
            (Effect{true, State::active, kOpen + Calls{"activate"}, kOpened + activating() + kActivated, ""}));
  EXPECT_EQ(effectOf([&] { return (second = ctx_open_session("LPE_P")) != nullptr; }),
            (Effect{true, State::active, {}, {}, ""}));
  EXPECT_EQ(effectOf([&] {
              return closeSession(first) == (Negotiated{1, properties({{0, 5000}})});
            }),
            (Effect{true, State::active, {}, negotiation("LPE_P", {second}), ""}));
  EXPECT_EQ(effectOf([&] { return closeSession(second) == kStopped; }),
            (Effect{true, State::closed, {"deactivate", "close"}, kInited + kDeactivated, kPuts}));
}

TEST(AudioClassification, ReportsThatTheSessionStayedOn) {
  void* const handle = ctx_open_session("LPE_P");
  platform().deactivateResult = -1;
  EXPECT_EQ(effectOf([&] { return closeSession(handle) == kFailed; }),
            (Effect{true,
                    State::active,
                    {"deactivate"},
                    kInited + Log{audio(kError, "deactivated aware session failed \n")},
                    kPuts}));
  EXPECT_EQ(effectOf([] { return ctx_open_session("LPE_P") != nullptr; }),
            (Effect{true, State::active, {}, kInited + Log{audio(kDebug, "already activated, return")}, ""}));
}

}  // namespace
}  // namespace api
