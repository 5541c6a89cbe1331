#include <fake_platform.h>
#include <gtest/gtest.h>
#include <senseloom.h>

#include <algorithm>
#include <cstdint>
#include <iterator>
#include <ostream>
#include <set>

#include "call.h"

// What only a fresh process shows: which calls make the sensors. Each of these tests has a process of its own.
namespace {

using oracle::kSensorNames;

bool hasAllSensors() {
  std::set<void*> found;
  for (const char* name : kSensorNames) found.insert(getSensor(name));
  return found.size() == std::size(kSensorNames) && found.count(nullptr) == 0;
}

bool hasNoSensor() {
  return std::all_of(std::begin(kSensorNames), std::end(kSensorNames),
                     [](const char* name) { return getSensor(name) == nullptr; });
}

uint8_t byte = 0;
void* result = &byte;
int length = 5;
ctx_option_t untouched;
ctx_option_t* list = &untouched;

// An entry point that needs the sensors, with arguments that are good and a handle that is not.
struct FirstCall {
  const char* name;
  void (*call)();
};
void PrintTo(const FirstCall& first, std::ostream* out) {
  *out << first.name;
}

class FirstCalls : public testing::TestWithParam<FirstCall> {};

TEST_P(FirstCalls, MakeAllSensorsAndReachNoPlatform) {
  EXPECT_TRUE(hasNoSensor());
  GetParam().call();
  EXPECT_TRUE(hasAllSensors());
  EXPECT_TRUE(fake::platform().calls.empty());
  EXPECT_TRUE(fake::platform().log.empty());
}

INSTANTIATE_TEST_SUITE_P(
    OfEveryEntryPoint, FirstCalls,
    testing::Values(FirstCall{"Open", [] { EXPECT_EQ(ctx_open_session("stap"), nullptr); }},
                    FirstCall{"OpenWithNull", [] { EXPECT_EQ(ctx_open_session(nullptr), nullptr); }},
                    FirstCall{"SetOption", [] { EXPECT_EQ(ctx_set_option(&byte, 0, "{}", &list), -1); }},
                    FirstCall{"Dispatch", [] { EXPECT_EQ(ctx_dispatch_data(&byte, &byte, 1, &result, &length), -1); }},
                    FirstCall{"Close", [] { EXPECT_EQ(ctx_close_session(&byte, &list), -1); }}),
    [](const auto& test) { return test.param.name; });

TEST(RefusedCalls, MakeNoSensorsAndWriteNothing) {
  EXPECT_EQ(ctx_dispatch_data(&byte, nullptr, 1, &result, &length), -1);
  EXPECT_EQ(ctx_dispatch_data(nullptr, &byte, 1, &result, &length), -1);
  EXPECT_EQ(ctx_dispatch_data(&byte, &byte, -1, &result, &length), -1);
  EXPECT_EQ(ctx_dispatch_data(&byte, &byte, INT32_MIN, &result, &length), -1);
  EXPECT_EQ(ctx_dispatch_data(&byte, &byte, 1, &result, nullptr), -1);
  EXPECT_EQ(ctx_dispatch_data(&byte, &byte, 1, nullptr, &length), -1);
  EXPECT_EQ(ctx_set_option(&byte, 0, nullptr, &list), -1);
  EXPECT_EQ(ctx_set_option(nullptr, 0, "{}", &list), -1);
  EXPECT_EQ(ctx_set_option(&byte, 0, "{}", nullptr), -1);
  EXPECT_EQ(ctx_close_session(nullptr, &list), -1);
  EXPECT_EQ(ctx_close_session(&byte, nullptr), -1);
  ctx_uninit();
  EXPECT_TRUE(hasNoSensor());
  EXPECT_EQ(result, &byte);
  EXPECT_EQ(length, 5);
  EXPECT_EQ(list, &untouched);
}

TEST(Handles, InsideASessionOrOfItsSensorAreUnknown) {
  void* const session = ctx_open_session("SHAKI");
  for (void* unknown : {static_cast<void*>(static_cast<uint8_t*>(session) + 1), getSensor("SHAKI")}) {
    EXPECT_EQ(ctx_set_option(unknown, 0, "{}", &list), -1);
    EXPECT_EQ(ctx_dispatch_data(unknown, &byte, 1, &result, &length), -1);
    EXPECT_EQ(ctx_close_session(unknown, &list), -1);
  }
  EXPECT_EQ(ctx_close_session(session, &list), 0);
}

}  // namespace
