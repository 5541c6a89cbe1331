// What callgrind counts: runs one of the scenarios below for one round, which makes all the memory and bindings that
// there are to make, and then for the round that is counted. Prints how many operations that one made.
#include <jansson.h>
#include <valgrind/callgrind.h>

#include <cstring>
#include <iterator>

#include "client.h"
#include "empty_call.h"
#include "records.h"

namespace {

using namespace bench;

struct Scenario {
  const char* name;
  size_t (*round)(const Scenario& scenario, const Clients& clients, Records& records);  // returns operations made
  const char* sensor;
  const char* option;
  Records (*records)();
  size_t clients = 1;
};

using Dispatch = decltype(ctx_dispatch_data);

// Every record to the one client.
template <Dispatch* dispatch>
size_t eachRecord(const Scenario&, const Clients& clients, Records& records) {
  void* const handle = clients[0].handle;
  void* result = nullptr;
  int length = records.size();
  const int size = records.size();
  for (uint8_t* record = records.begin(); record != records.end(); record += size) {
    dispatch(handle, record, size, &result, &length);
  }
  return records.count();
}

// One record to every client.
size_t eachClient(const Scenario&, const Clients& clients, Records& records) {
  void* result = nullptr;
  int length = 0;
  for (const Client& client : clients)
    ctx_dispatch_data(client.handle, records.begin(), records.size(), &result, &length);
  return clients.size();
}

size_t setOption(const Scenario& scenario, const Clients& clients, Records&) {
  constexpr size_t kTimes = 20;
  for (size_t i = 0; i < kTimes; ++i) clients[0].setOption(scenario.option);
  return kTimes;
}

template <size_t items>
Records activitiesOf() {
  return activities(items);
}

constexpr const char* kBatchOf1 = R"({"logN": 0})";
constexpr const char* kBatchOf4 = R"({"logN": 2})";
constexpr const char* kBatchOf32 = R"({"logN": 5})";
constexpr const char* kBatchOf256 = R"({"logN": 8})";
constexpr const char* kOnChange = R"({"mode": 1, "logN": 2})";
constexpr const char* kGrowingWeights = R"({"logN": 8, "weightVar": 3})";
constexpr const char* kHalfOfFlicks = R"({"classMask": 21})";
constexpr const char* kAllFlicks = R"({"classMask": 63, "level": 0})";
constexpr const char* kTaps = R"({"classMask": 3, "level": 0})";
constexpr const char* kActivity =
    R"({"mode": 0, "logN": 2, "logM": 0, "classMask": 15, "summary": 1, "weightVar": 1, "continuous": 0})";

constexpr auto eachRecordToLibrary = eachRecord<ctx_dispatch_data>;
constexpr auto eachRecordToNothing = eachRecord<empty_call>;

constexpr Scenario kScenarios[] = {
    {"empty call", eachRecordToNothing, "GSFLK", kAllFlicks, randomFlicks},
    {"flick filter, all delivered", eachRecordToLibrary, "GSFLK", kAllFlicks, randomFlicks},
    {"flick filter, half delivered", eachRecordToLibrary, "GSFLK", kHalfOfFlicks, randomFlicks},
    {"dead reckoning, N 6", eachRecordToLibrary, "PDR", R"({"N": 6})", deadReckonings},
    {"activity, 1 item, batch 1", eachRecordToLibrary, "PHYAC", kBatchOf1, activitiesOf<1>},
    {"activity, 1 item, batch 4", eachRecordToLibrary, "PHYAC", kBatchOf4, activitiesOf<1>},
    {"activity, 1 item, batch 32", eachRecordToLibrary, "PHYAC", kBatchOf32, activitiesOf<1>},
    {"activity, 1 item, batch 256", eachRecordToLibrary, "PHYAC", kBatchOf256, activitiesOf<1>},
    {"activity, 64 items, batch 1", eachRecordToLibrary, "PHYAC", kBatchOf1, activitiesOf<64>},
    {"activity, 64 items, batch 4", eachRecordToLibrary, "PHYAC", kBatchOf4, activitiesOf<64>},
    {"activity, 64 items, batch 32", eachRecordToLibrary, "PHYAC", kBatchOf32, activitiesOf<64>},
    {"activity, 64 items, batch 256", eachRecordToLibrary, "PHYAC", kBatchOf256, activitiesOf<64>},
    {"activity, 1 item, on change, batch 1", eachRecordToLibrary, "PHYAC", R"({"mode": 1})", activitiesOf<1>},
    {"activity, 1 item, on change, batch 4", eachRecordToLibrary, "PHYAC", kOnChange, activitiesOf<1>},
    {"activity, 64 items, on change, batch 1", eachRecordToLibrary, "PHYAC", R"({"mode": 1})", activitiesOf<64>},
    {"activity, 64 items, on change, batch 4", eachRecordToLibrary, "PHYAC", kOnChange, activitiesOf<64>},
    {"activity, 64 items, growing, batch 256", eachRecordToLibrary, "PHYAC", kGrowingWeights, activitiesOf<64>},
    {"fan-out, 100 sessions", eachClient, "GSFLK", kAllFlicks, randomFlicks, 100},
    {"fan-out, 10000 sessions", eachClient, "GSFLK", kAllFlicks, randomFlicks, 10000},
    {"tapping option, 1 session", setOption, "STAP", kTaps, randomFlicks, 1},
    {"tapping option, 100 sessions", setOption, "STAP", kTaps, randomFlicks, 100},
    {"activity option, 1 session", setOption, "PHYAC", kActivity, randomFlicks, 1},
    {"activity option, 100 sessions", setOption, "PHYAC", kActivity, randomFlicks, 100},
};

}  // namespace

int main(int argc, char** argv) {
  if (argc == 2 && std::strcmp(argv[1], "--list") == 0) {
    for (const Scenario& scenario : kScenarios) std::puts(scenario.name);
    return 0;
  }
  require(argc == 2, "usage: scenarios --list | NAME");

  json_object_seed(1);  // else jansson hashes the keys of an option differently in every process
  for (const Scenario& scenario : kScenarios) {
    if (std::strcmp(scenario.name, argv[1]) != 0) continue;
    const Clients clients(scenario.clients, scenario.sensor);
    clients[0].setOption(scenario.option);
    auto records = scenario.records();
    scenario.round(scenario, clients, records);
    CALLGRIND_START_INSTRUMENTATION;
    const size_t operations = scenario.round(scenario, clients, records);
    CALLGRIND_STOP_INSTRUMENTATION;
    std::printf("%zu\n", operations);
    return 0;
  }
  require(false, "no such scenario");
}
