// Records are dispatched many times a second, so taking one allocates nothing in any kind of session.
#include <android/log.h>
#include <gtest/gtest.h>

#include <ostream>
#include <string>

#include "allocations.h"
#include "bytes_of.h"
#include "fake_registry.h"
#include "session/gesture_engine.h"
#include "session/session_kinds.h"

// A platform whose own allocations do not count.
int __android_log_print(int, const char*, const char*, ...) {
  return 0;
}
bool gesture_initial(int, int) {
  return true;
}
char* gesture_process_single_data(const int16_t*, int, bool) {
  const fake::UncountedAllocations here;
  return new char[9]{'L', 'e', 't', 't', 'e', 'r', 'A', ' '};
}
void gesture_close() {}

namespace senseloom {
namespace {

template <class SessionKind>
std::unique_ptr<Session> create() {
  return std::make_unique<SessionKind>();
}

struct Kind {
  const char* name;
  std::unique_ptr<Session> (*create)();
  const char* option;
  // Dispatched round after round, with a new timestamp each time: records that are delivered, dropped and refused.
  std::vector<Bytes> records;
  int deliveries;  // in four rounds
};
void PrintTo(const Kind& kind, std::ostream* out) {
  *out << kind.name;
}

constexpr uint64_t kTimestamp = 0;

// Records with a 16-bit value, and one that is too short.
std::vector<Bytes> valued() {
  return {bytesOf(kTimestamp, int16_t{1}), bytesOf(kTimestamp, int16_t{0}), bytesOf(kTimestamp)};
}
std::vector<Bytes> counted() {
  return {bytesOf(kTimestamp, int32_t{1}), bytesOf(kTimestamp, int32_t{300}), bytesOf(kTimestamp)};
}
// Three items, one, none, and more than there are.
std::vector<Bytes> activities() {
  return {bytesOf(kTimestamp, int16_t{3}, uint16_t{0x11}, uint16_t{0x21}, uint16_t{0x32}),
          bytesOf(kTimestamp, int16_t{1}, uint16_t{0x43}), bytesOf(kTimestamp, int16_t{0}),
          bytesOf(kTimestamp, int16_t{2}, uint16_t{0x55})};
}

const Kind kKinds[] = {
    {"ActivityByDefault", create<SessionActivity>, "{}", activities(), 8},
    {"ActivityVoted", create<SessionActivity>, R"({"logN":2,"weightVar":1})", activities(), 4},
    {"ActivityVotedOnChange", create<SessionActivity>, R"({"logN":2,"mode":1,"classMask":2})", activities(), 1},
    {"ActivityUnvotedOnChange", create<SessionActivity>, R"({"logN":1,"mode":1,"summary":0})", activities(), 4},
    {"Tapping", create<SessionTapping>, "{}", valued(), 4},
    {"GestureFlick", create<SessionGestureFlick>, "{}", valued(), 4},
    {"Shaking", create<SessionShaking>, "{}", valued(), 12},
    {"InstantActivity", create<SessionInstantActivity>, "{}", counted(), 4},
    {"StepCount", create<SessionStepCount>, R"({"mode":0,"logN":3})", counted(), 4},
    {"StepCountOfEveryUpdate", create<SessionStepCount>, "{}", counted(), 12},
    {"GestureHMM",
     create<SessionGestureHMM>,
     "{}",
     {joined(bytesOf(kTimestamp, int16_t{0}, uint16_t{24}), std::vector<int16_t>(12)), bytesOf(kTimestamp)},
     4},
    {"DTWGS", create<SessionDTWGS>, R"({"mode":4,"classMask":1})", valued(), 4},
    {"GestureEartouch", create<SessionGestureEartouch>, "{}", valued(), 4},
    {"AudioClassification", create<SessionAudioClassification>, "{}", valued(), 12},
    {"PDR",
     create<SessionPDR>,
     R"({"N":1})",
     {joined(bytesOf(kTimestamp, int16_t{1}), std::vector<uint8_t>(28)), bytesOf(kTimestamp, int16_t{2})},
     2},
    {"Lift", create<SessionLift>, "{}", valued(), 12},
};

class Allocations : public testing::TestWithParam<Kind> {
 protected:
  void SetUp() override { fake::registry() = {.name = "PHYAC", .sensor = &sensor}; }
  void TearDown() override { fake::registry() = {}; }

  fake::Sensor sensor;
};

TEST_P(Allocations, AreNotMadeForARecord) {
  const auto session = GetParam().create();
  ASSERT_EQ(session->parseOption(GetParam().option), 0);
  sensor.mergedOption = session->ownOption().clone();
  ASSERT_EQ(session->buildProc(), 0);
  std::vector<Bytes> records = GetParam().records;

  int deliveries = 0;
  const fake::AllocationCount allocations;
  for (int round = 1; round <= 4; ++round) {
    for (Bytes& record : records) {
      ++record[0];
      void* out;
      int outLen;
      deliveries += session->postProcess(record.data(), static_cast<int>(record.size()), &out, &outLen) == 1;
    }
  }
  EXPECT_EQ(allocations.made(), 0U);
  EXPECT_EQ(deliveries, GetParam().deliveries);
}

INSTANTIATE_TEST_SUITE_P(Kinds, Allocations, testing::ValuesIn(kKinds),
                         [](const auto& tested) { return std::string(tested.param.name); });

TEST(AllocationCount, CountsEveryWayOfAllocating) {
  const fake::AllocationCount allocations;
  const auto object = std::make_unique<uint64_t>();
  fake::use(object.get());
  const auto array = std::make_unique<uint64_t[]>(3);
  fake::use(array.get());
  const ResultBuffer<7> memory;
  fake::use(memory.bytes().data());
  EXPECT_EQ(allocations.made(), 3U);
}

}  // namespace
}  // namespace senseloom
