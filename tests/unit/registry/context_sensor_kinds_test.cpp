#include "registry/context_sensor_kinds.h"

#include <gtest/gtest.h>

#include <ostream>
#include <string>

#include "fake_option.h"
#include "fake_platform.h"
#include "fake_sensor.h"
#include "fake_session.h"

namespace senseloom {
namespace {

using Events = std::vector<std::string>;

struct Kind {
  const char* name;
  std::unique_ptr<ContextSensor> (*make)();
};
void PrintTo(const Kind& kind, std::ostream* out) {
  *out << kind.name;
}

template <class Sensor>
std::unique_ptr<ContextSensor> make() {
  return std::make_unique<Sensor>();
}

const Kind kKinds[] = {
    {"PHYAC", make<ContextSensorActivity>},
    {"STAP", make<ContextSensorTapping>},
    {"GSFLK", make<ContextSensorGestureFlick>},
    {"SHAKI", make<ContextSensorShaking>},
    {"ISACT", make<ContextSensorInstantActivity>},
    {"SCOUN", make<ContextSensorStepCount>},
    {"GSPX", make<ContextSensorGestureHMM>},
    {"DTWGS", make<ContextSensorDTWGS>},
    {"GSETH", make<ContextSensorGestureEartouch>},
    {"LPE_P", make<ContextSensorAudioClassification>},
    {"PDR", make<ContextSensorPDR>},
    {"LIFT", make<ContextSensorLift>},
};

class SensorKind : public testing::TestWithParam<Kind> {
 protected:
  void TearDown() override { fake::platform() = {}; }

  Events& calls = fake::platform().calls;
  std::unique_ptr<ContextSensor> sensor = GetParam().make();
};

TEST_P(SensorKind, HasNoSessionsAndNoMergedOptionAtFirst) {
  EXPECT_EQ(sensor->mergedOption, nullptr);
  EXPECT_TRUE(sensor->sessions.empty());
}

TEST_P(SensorKind, MakesANewSessionOfItsKindEachTime) {
  const auto one = sensor->createSession();
  const auto two = sensor->createSession();
  EXPECT_STREQ(one->name, GetParam().name);
  EXPECT_STREQ(two->name, GetParam().name);
  EXPECT_NE(one, two);
  EXPECT_TRUE(sensor->sessions.empty()) << "it is the registry that lists sessions";
}

TEST_P(SensorKind, TakesItsMergedOptionWithItButNoSessionAndDoesNotStop) {
  fake::NamedSession session(GetParam().name, "a", calls);
  sensor->sessions.push_back(&session);
  sensor->mergedOption = std::make_unique<fake::NamedOption>("merged", calls);
  sensor.reset();
  EXPECT_EQ(calls, Events{"merged destroyed"});
}

INSTANTIATE_TEST_SUITE_P(Kinds, SensorKind, testing::ValuesIn(kKinds),
                         [](const auto& tested) { return std::string(tested.param.name); });

TEST(ContextSensor, StartsAndStopsWithoutDoingAnything) {
  fake::Sensor sensor;
  EXPECT_TRUE(sensor.onStart());
  EXPECT_TRUE(sensor.onStop());
}

TEST(ContextSensor, AllButTheAudioSensorStartAndStopWithoutThePlatform) {
  for (const Kind& kind : kKinds) {
    if (std::string(kind.name) == "LPE_P") continue;
    const auto sensor = kind.make();
    EXPECT_TRUE(sensor->onStart()) << kind.name;
    EXPECT_TRUE(sensor->onStop()) << kind.name;
  }
  EXPECT_EQ(fake::platform().calls, Events{});
}

class AudioSensor : public testing::Test {
 protected:
  void TearDown() override {
    platform = {};
    device = nullptr;
    gIsActivated = false;
  }

  fake::Platform& platform = fake::platform();
  ContextSensorAudioClassification sensor;
};

TEST_F(AudioSensor, SwitchesTheAwareSessionOnAndOff) {
  EXPECT_TRUE(sensor.onStart());
  EXPECT_EQ(platform.calls, (Events{"get aware.primary", "open aware_hw_if", "activate"}));
  EXPECT_TRUE(gIsActivated);
  platform.calls.clear();
  EXPECT_TRUE(sensor.onStop());
  EXPECT_EQ(platform.calls, (Events{"deactivate", "close"}));
  EXPECT_FALSE(gIsActivated);
}

TEST_F(AudioSensor, TellsWhenTheAwareSessionCanNotBeSwitched) {
  platform.activateResult = -1;
  EXPECT_FALSE(sensor.onStart());
  platform.activateResult = 0;
  EXPECT_TRUE(sensor.onStart());
  platform.deactivateResult = -1;
  EXPECT_FALSE(sensor.onStop());
}

}  // namespace
}  // namespace senseloom
