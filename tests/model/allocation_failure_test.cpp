#include <fake_platform.h>
#include <gtest/gtest.h>
#include <senseloom.h>

#include <algorithm>
#include <array>
#include <bit>
#include <cstdlib>
#include <memory>
#include <new>
#include <string>
#include <utility>
#include <vector>

#include "client.h"
#include "generator.h"
#include "held_lists.h"
#include "library_memory.h"
#include "model/model.h"

// Every call of a scenario is made with its first, its second, ... allocation failing, until it succeeds: with that one
// failing alone and with all from that one on, made again afterwards and not. It has to return its failure value, and
// what comes after it has to go as if the call had not been made.
namespace oracle {
namespace {

// What can have failed: one of the allocations of a call, or that one and all after it, which are in this order. Of
// the sessions of a sensor any can have failed to be rebuilt, since it depends on them whether they allocate.
std::vector<Shortage> shortages(bool forEver, bool rebuilds) {
  constexpr uint32_t kSessions = 6;
  std::vector<Shortage> all;
  for (uint32_t sessions = 0; sessions < (rebuilds ? 1U << kSessions : 1U); ++sessions) {
    for (int first = 0; first < 6; ++first) {
      const auto fails = [&](int step) { return step == first || (forEver && step > first); };
      const int rebuildFailures = std::popcount(sessions);
      if (first == 5 ? rebuildFailures == 0 : rebuildFailures > 0 && !forEver) continue;
      if (rebuildFailures > 1 && !forEver) continue;
      all.push_back({fails(0), fails(1), fails(2), fails(3), fails(4), sessions});
    }
  }
  return all;
}

// A client and all the models that agree with what it has seen so far. One is left unless a failure can have had
// several reasons that do not show yet.
class Trial {
 public:
  Trial() : models(1) { models[0].deviceAddress = fake::platform().deviceAddress(); }
  ~Trial() { client.restore(); }
  Trial(const Trial&) = delete;
  Trial& operator=(const Trial&) = delete;

  // Returns how many records the sessions delivered.
  int make(const Call& call) {
    int delivered = 0;
    for (void* handle : client.targets(call)) {
      const Observation observation = client.make(call, handle);
      delivered += observation.outcome.delivers == Outcome::nothing ? 0 : 1;
      agree(call, handle, observation, {{}});
    }
    return delivered;
  }

  // Makes the call with that allocation failing. Returns false if it does not make so many, and went well.
  bool makeFailing(const Call& call, size_t allocation, bool forEver) {
    const auto handles = client.targets(call);
    if (handles.empty()) return false;
    memory::failAt(allocation, forEver);
    const Observation observation = client.make(call, handles[0]);
    const bool failed = memory::stopFailing();
    agree(call, handles[0], observation,
          failed ? shortages(forEver, sensorOf(call) == phyac) : std::vector<Shortage>{{}});
    return failed;
  }

  void closeAll() {
    Call call;
    call.what = Call::close;
    while (!client.openSessions().empty()) {
      call.session = client.openSessions().front();
      make(call);
      if (::testing::Test::HasFailure()) return;
    }
  }

 private:
  void agree(const Call& call, void* handle, const Observation& observation, const std::vector<Shortage>& reasons) {
    EXPECT_EQ(observation.complaint, "") << toJson(call);
    std::vector<Model> agreeing;
    std::string differences;
    for (const Model& model : models) {
      for (const Shortage& reason : reasons) {
        Model then = model;
        then.shortage = reason;
        const Outcome expected = makeOnModel(then, call, handle, observation.opened);
        then.shortage = {};
        const std::string text = difference(expected, observation.outcome);
        if (!text.empty()) {
          differences += "\n  " + text;
        } else if (std::find(agreeing.begin(), agreeing.end(), then) == agreeing.end()) {
          agreeing.push_back(then);
        }
      }
    }
    ASSERT_FALSE(agreeing.empty()) << toJson(call) << differences;
    models = std::move(agreeing);
    if (observation.list != nullptr) held.take(client.sensorOf(call.session), observation, models[0]);
    EXPECT_EQ(held.difference(models[0]), "") << toJson(call);
    if (call.what == Call::close && !models[0].isLive(handle)) client.noteClosed(call, handle);
  }

  int sensorOf(const Call& call) const {
    return call.what == Call::setOption || call.what == Call::close ? client.sensorOf(call.session) : call.sensor;
  }

  Client client;
  std::vector<Model> models;
  HeldLists held;
};

// Returns how many failures there were of each call.
std::vector<size_t> failEachAllocation(const Sequence& scenario) {
  std::vector<size_t> failures(scenario.size());
  {
    Trial trial;
    for (const Call& call : scenario) trial.make(call);
    trial.closeAll();
  }
  const size_t blocks = memory::blocks();
  for (size_t failing = 0; failing < scenario.size(); ++failing) {
    for (const auto& [forEver, again] : {std::pair{false, false}, {false, true}, {true, false}, {true, true}}) {
      bool failed = true;
      for (size_t allocation = 1; failed; ++allocation) {
        SCOPED_TRACE("allocation " + std::to_string(allocation) + (forEver ? " and all later ones" : "") + " of call " +
                     std::to_string(failing + 1) + (again ? ", made again" : "") + ", of\n" + toTrace(scenario));
        {
          Trial trial;
          for (size_t i = 0; i < failing; ++i) trial.make(scenario[i]);
          failed = trial.makeFailing(scenario[failing], allocation, forEver);
          for (size_t i = failing + (failed && again ? 0 : 1); i < scenario.size(); ++i) trial.make(scenario[i]);
          trial.closeAll();
        }
        EXPECT_EQ(memory::blocks(), blocks);
        if (::testing::Test::HasFailure()) return failures;
        failures[failing] += failed ? 1 : 0;
      }
    }
  }
  return failures;
}

Call openCall(int session, int sensor) {
  Call call;
  call.what = Call::open;
  call.session = session;
  call.sensor = sensor;
  return call;
}

Call optionCall(int session, const char* text) {
  Call call;
  call.what = Call::setOption;
  call.session = session;
  call.option.verbatim = text;
  return call;
}

Call dispatchCall(int session, const Bytes& record, const std::vector<std::optional<std::string>>& names = {}) {
  Call call;
  call.what = Call::dispatch;
  call.session = session;
  call.record = record;
  call.answers.names = names;
  return call;
}

Call closeCall(int session) {
  Call call;
  call.what = Call::close;
  call.session = session;
  return call;
}

struct SensorCase {
  int sensor;
  std::array<const char*, 2> options;
  Bytes payload;  // of a record, from its timestamp on
  std::vector<std::optional<std::string>> names = {};
};

void PrintTo(const SensorCase& sensorCase, std::ostream* out) {
  *out << kSensorNames[sensorCase.sensor];
}

Bytes record(uint8_t timestamp, const Bytes& payload) {
  Bytes bytes(8 + payload.size());
  bytes[0] = timestamp;
  std::copy(payload.begin(), payload.end(), bytes.begin() + 8);
  return bytes;
}

class AllocationFailure : public ::testing::TestWithParam<SensorCase> {};

TEST_P(AllocationFailure, MakesTheCallFailAndChangesNothing) {
  const auto& [sensor, options, payload, names] = GetParam();
  const Call uninit;
  const Sequence scenario = {
      openCall(0, sensor),
      optionCall(0, options[0]),
      openCall(1, sensor),
      dispatchCall(0, record(1, payload), names),
      optionCall(1, options[1]),
      dispatchCall(0, record(2, payload), names),
      dispatchCall(1, record(2, payload), names),
      openCall(2, sensor),
      optionCall(0, options[1]),
      dispatchCall(0, record(3, payload), names),
      dispatchCall(1, record(3, payload), names),
      closeCall(0),
      dispatchCall(1, record(4, payload), names),
      // Without sensors every call has to make them.
      uninit,
      dispatchCall(1, record(5, payload), names),
      uninit,
      optionCall(1, options[0]),
      dispatchCall(1, record(6, payload), names),
      openCall(0, sensor),
      closeCall(2),
      uninit,
      closeCall(1),
  };
  const auto failures = failEachAllocation(scenario);
  for (size_t i = 0; i < scenario.size(); ++i) {
    const Call::What what = scenario[i].what;
    const bool makesSensors = what != Call::uninit && (i == 0 || scenario[i - 1].what == Call::uninit);
    const bool negotiates = what == Call::setOption || what == Call::close;
    EXPECT_EQ(failures[i] > 0, makesSensors || negotiates || what == Call::open) << i << ' ' << toJson(scenario[i]);
  }
}

const SensorCase kSensorCases[] = {
    {phyac,
     {R"({"logN":3,"logM":1})", R"({"logN":2,"mode":1,"summary":0})"},
     {6, 0, 0x51, 0, 0x62, 0, 0x71, 0, 0x82, 0, 0x91, 0, 0xA1, 0}},
    {stap, {R"({"classMask":1,"level":-2})", R"({"classMask":9})"}, {1, 0}},
    {gsflk, {R"({"classMask":32,"level":7})", R"({"level":2})"}, {6, 0}},
    {shaki, {R"({"sensitivity":0})", R"({"sensitivity":3})"}, {1, 0}},
    {isact, {R"({"classMask":1})", R"({"classMask":6})"}, {2, 0, 0, 0}},
    {scoun, {R"({"mode":0,"logN":2})", R"({"mode":0})"}, {100, 0, 0, 0}},
    {gspx,
     {R"({"classMask":1024})", R"({"classMask":1025})"},
     {0, 0, 14, 0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14},
     {"NumberOne ", "LetterA "}},
    {dtwgs,
     {R"({"mode":4,"classMask":3,"template1":"0003a1b2c3"})",
      R"({"mode":4,"classMask":2,"level":-1,"template2":"0001ff"})"},
     {1, 0}},
    {gseth, {R"({"classMask":1})", R"({"classMask":2})"}, {2, 0}},
    {lpe, {R"({"interval":1})", R"({"interval":2})"}, {1, 0}},
    {pdr,
     {R"({"N":1,"userHeight":170,"6DOF":1})", R"({"N":2})"},
     {1, 0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15, 16, 17, 18, 19, 20, 21, 22, 23, 24, 25, 26, 27, 28}},
    {lift, {R"({"classMask":1})", "{}"}, {1, 0}},
};
static_assert(std::size(kSensorCases) == kSensors, "a case for each sensor");

INSTANTIATE_TEST_SUITE_P(Sensors, AllocationFailure, ::testing::ValuesIn(kSensorCases),
                         [](const auto& sensor) { return kSensorNames[sensor.param.sensor]; });

TEST(AllocationFailures, MakeTheCallsOfRandomSequencesFailAndChangeNothing) {
  for (uint64_t seed = 0; seed < 10; ++seed) {
    RandomChoices choices(seed);
    Sequence sequence = makeSequence(choices);
    std::erase_if(sequence,
                  [](const Call& call) { return call.misuse != Call::none || call.what == Call::dispatchToSensor; });
    failEachAllocation(sequence);
    if (HasFailure()) return;
  }
}

// A compiler may leave out an allocation whose address goes nowhere.
void* volatile gSeen;
void* seen(void* memory) {
  gSeen = memory;
  return memory;
}

TEST(Allocations, AreWatchedWhicheverWayTheyAreMade) {
  const memory::AllocationCount allocations;
  const auto object = std::make_unique<uint64_t>();
  const auto array = std::make_unique<uint64_t[]>(3);
  const std::unique_ptr<uint64_t> other(new (std::nothrow) uint64_t);
  const std::unique_ptr<uint64_t[]> others(new (std::nothrow) uint64_t[3]);
  for (uint64_t* memory : {object.get(), array.get(), other.get(), others.get()}) seen(memory);
  std::free(seen(std::realloc(seen(std::malloc(4)), 400)));
  std::free(seen(std::calloc(4, 4)));
  EXPECT_EQ(allocations.made(), 7);
  const memory::FailingAllocation second(2);
  std::free(seen(std::malloc(4)));
  EXPECT_FALSE(second.happened());
  EXPECT_THROW(seen(std::make_unique<uint64_t>().get()), std::bad_alloc);
  EXPECT_TRUE(second.happened());
}

// Records are dispatched many times a second. A sequence has each sensor's records delivered, held back and refused.
TEST(Allocations, AreNotMadeForARecord) {
  std::array<int, kSensors> delivered{};
  for (uint64_t seed = 0; seed < 400; ++seed) {
    RandomChoices choices(seed);
    const Sequence sequence = makeSequence(choices);
    Trial trial;
    for (const Call& call : sequence) {
      // The first call after an uninit makes the sensors anew.
      if (call.what == Call::uninit) continue;
      const size_t before = memory::allocations();
      const bool isRecord = call.what == Call::dispatch || call.what == Call::dispatchToSensor;
      const int results = trial.make(call);
      ASSERT_TRUE(!isRecord || memory::allocations() == before) << toJson(call) << " of\n" << toTrace(sequence);
      if (call.what == Call::dispatchToSensor) delivered[static_cast<size_t>(call.sensor)] += results;
    }
    trial.closeAll();
  }
  for (size_t sensor = 0; sensor < delivered.size(); ++sensor) EXPECT_GT(delivered[sensor], 0) << kSensorNames[sensor];
}

// What holds the sessions grows now and then.
TEST(AllocationFailures, MakeAnyOpenOfManyFailAndLoseNoSession) {
  {
    Trial trial;
    for (int session = 0; session < 70; ++session) {
      for (const bool forEver : {false, true}) {
        const Call call = openCall(session, session % kSensors);
        size_t allocation = 1;
        while (trial.makeFailing(call, allocation, forEver)) ++allocation;
        EXPECT_GT(allocation, 1);
        if (!forEver) trial.make(closeCall(session));
      }
    }
    for (int session = 0; session < 70; ++session) trial.make(dispatchCall(session, record(1, {1, 0, 0, 0})));
    trial.closeAll();
  }
  EXPECT_LE(memory::blocks(), 1);  // what holds the sessions stays
}

TEST(AllocationFailures, DoNotMatterToTheAudioBridge) {
  Trial trial;
  for (const auto what : {Call::audioInit, Call::audioActivate, Call::audioActivate, Call::audioDeactivate}) {
    Call call;
    call.what = what;
    EXPECT_FALSE(trial.makeFailing(call, 1, true));
  }
}

TEST(AllocationFailures, LeaveTheGrowableArrayWithoutStorage) {
  const size_t blocks = memory::blocks();
  varray_t array{};
  memory::failAt(1, false);
  EXPECT_EQ(_va_init(&array, 4), nullptr);
  EXPECT_TRUE(memory::stopFailing());
  EXPECT_EQ(array.count, 0);
  EXPECT_EQ(array.capacity, 16);
  EXPECT_EQ(array.elemSize, 4);
  EXPECT_EQ(array.data, nullptr);
  EXPECT_EQ(va_new(&array), nullptr);
  va_free(&array);
  EXPECT_EQ(memory::blocks(), blocks);
}

TEST(AllocationFailures, LeaveTheGrowableArrayAsItWas) {
  const size_t blocks = memory::blocks();
  varray_t array{};
  ASSERT_NE(_va_init(&array, 1), nullptr);
  for (char c = 'a'; c < 'a' + 16; ++c) *static_cast<char*>(va_new(&array)) = c;
  const varray_t before = array;
  for (const bool forEver : {false, true}) {
    memory::failAt(1, forEver);
    EXPECT_EQ(va_new(&array), nullptr);
    EXPECT_TRUE(memory::stopFailing());
    EXPECT_EQ(array.count, 16);
    EXPECT_EQ(array.capacity, 16);
    EXPECT_EQ(array.data, before.data);
  }
  *static_cast<char*>(va_new(&array)) = 'q';
  EXPECT_EQ(std::string(static_cast<char*>(array.data), 17), "abcdefghijklmnopq");
  va_free(&array);
  EXPECT_EQ(memory::blocks(), blocks);
}

}  // namespace
}  // namespace oracle
