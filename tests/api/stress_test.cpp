#include <gtest/gtest.h>
#include <library_memory.h>
#include <senseloom.h>

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <iterator>
#include <random>
#include <utility>
#include <vector>

namespace {

struct SensorCase {
  const char* name;
  const char* option;
  std::vector<uint8_t> payload;  // of a record, from its timestamp on
};

const SensorCase kSensors[] = {
    {"PHYAC", R"({"logN":2,"mode":1,"weightVar":1})", {2, 0, 0x51, 0, 0x62, 0}},
    {"STAP", R"({"classMask":1,"level":-1})", {1, 0}},
    {"GSFLK", R"({"classMask":5})", {3, 0}},
    {"SHAKI", R"({"sensitivity":2})", {1, 0}},
    {"ISACT", R"({"classMask":3})", {2, 0, 0, 0}},
    {"SCOUN", R"({"mode":0})", {100, 0, 0, 0}},
    {"GSPX", R"({"classMask":1024})", {0, 0, 12, 0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12}},
    {"DTWGS", R"({"mode":4,"classMask":3,"template1":"0003a1b2c3"})", {1, 0}},
    {"GSETH", R"({"classMask":2})", {2, 0}},
    {"LPE_P", R"({"interval":100})", {1, 0}},
    {"PDR", R"({"N":1,"userHeight":170})", std::vector<uint8_t>(2 + 28)},
    {"LIFT", "{}", {1, 0}},
};

// A service with many clients, which come and go in random order.
class Service {
 public:
  explicit Service(uint32_t seed) : random(seed) {}

  // Every session is opened, negotiated and fed, some of them often, and closed. The sensors go, too.
  void run(int sessionsToOpen) {
    while (sessionsToOpen > 0 || !sessions.empty()) {
      const uint32_t choice = below(8);
      if (sessions.empty() || (choice < 4 && sessionsToOpen > 0)) {
        open();
        --sessionsToOpen;
      } else if (choice == 4) {
        setOption(anySession());
      } else if (choice == 5) {
        dispatch(anySession());
      } else if (choice == 6 || sessionsToOpen == 0) {
        close(anySession());
      }
      if (::testing::Test::HasFatalFailure()) return;
    }
    ctx_uninit();
  }

  size_t mostOpen() const { return most; }

 private:
  struct Session {
    void* handle;
    const SensorCase* sensor;
    bool isNegotiated = false;
    bool isFed = false;
  };

  uint32_t below(uint32_t bound) { return static_cast<uint32_t>(random()) % bound; }
  size_t anySession() { return below(static_cast<uint32_t>(sessions.size())); }

  void open() {
    const SensorCase& sensor = kSensors[below(std::size(kSensors))];
    void* handle = ctx_open_session(sensor.name);
    ASSERT_NE(handle, nullptr) << sensor.name;
    sessions.push_back({handle, &sensor});
    most = std::max(most, sessions.size());
  }

  void setOption(size_t index) {
    Session& session = sessions[index];
    session.isNegotiated = true;
    ctx_option_t* list = nullptr;
    ASSERT_EQ(ctx_set_option(session.handle, 0, session.sensor->option, &list), 0) << session.sensor->name;
    ctx_option_release(list);
  }

  void dispatch(size_t index) {
    Session& session = sessions[index];
    session.isFed = true;
    const uint64_t now = ++timestamp;
    std::vector<uint8_t> record(sizeof now);
    std::memcpy(record.data(), &now, sizeof now);
    record.insert(record.end(), session.sensor->payload.begin(), session.sensor->payload.end());
    void* result = nullptr;
    int length = 0;
    ASSERT_GE(ctx_dispatch_data(session.handle, record.data(), static_cast<int>(record.size()), &result, &length), 0)
        << session.sensor->name;
  }

  void close(size_t index) {
    if (!sessions[index].isNegotiated) setOption(index);
    if (!sessions[index].isFed) dispatch(index);
    std::swap(sessions[index], sessions.back());
    const Session session = sessions.back();
    sessions.pop_back();
    ctx_option_t* list = nullptr;
    const int returned = ctx_close_session(session.handle, &list);
    ASSERT_TRUE(returned == 0 || returned == 1) << session.sensor->name << ' ' << returned;
    ASSERT_TRUE(list == nullptr || returned == 1) << session.sensor->name;
    ctx_option_release(list);
  }

  std::mt19937 random;
  std::vector<Session> sessions;
  uint64_t timestamp = 0;
  size_t most = 0;
};

TEST(Stress, TenThousandSessionsLeaveNoMemoryBehind) {
  const char* given = std::getenv("SENSELOOM_TEST_SEED");
  const auto seed = given != nullptr ? static_cast<uint32_t>(std::strtoul(given, nullptr, 10)) : std::random_device{}();
  std::printf("SENSELOOM_TEST_SEED=%lu\n", static_cast<unsigned long>(seed));

  for (int round = 0; round < 2; ++round) {
    Service service(seed);
    service.run(10000);
    EXPECT_GT(service.mostOpen(), 5000);
    EXPECT_EQ(memory::blocks(), 0);
    EXPECT_EQ(memory::bytes(), 0);
  }
}

// Opens and closes that many sessions of each sensor.
void openAndClose(size_t count) {
  std::vector<void*> handles;
  for (const SensorCase& sensor : kSensors) {
    for (size_t i = 0; i < count; ++i) handles.push_back(ctx_open_session(sensor.name));
  }
  for (void* handle : handles) {
    ctx_option_t* list = nullptr;
    ASSERT_GE(ctx_close_session(handle, &list), 0);
    ctx_option_release(list);
  }
}

TEST(Stress, SensorsWithoutSessionsKeepTheirMergedOptionAlone) {
  openAndClose(2);
  const size_t blocks = memory::blocks();
  const size_t bytes = memory::bytes();
  EXPECT_EQ(blocks, 2 * std::size(kSensors));  // the sensors and their merged options
  openAndClose(100);
  EXPECT_EQ(memory::blocks(), blocks);
  EXPECT_EQ(memory::bytes(), bytes);
  ctx_uninit();
  EXPECT_EQ(memory::blocks(), 0);
  EXPECT_EQ(memory::bytes(), 0);
}

}  // namespace
