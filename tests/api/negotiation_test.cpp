#include <numeric>
#include <span>

#include "client.h"

// What the sessions of a sensor become together: every sensor with 1 to 3 sessions, in every order of setting their
// options and every order of closing them, against merge rules of the test's own.
namespace api {
namespace {

enum class Rule { allOne, bitOr, clonedWins, lastWins, maximum, minimum };

struct Key {
  const char* name;
  Rule rule;
  int32_t id;
  int32_t unset;  // of a session without an option string
  std::array<int32_t, 3> values;
};

constexpr size_t kMostSessions = 3;

struct Sensor {
  const char* name;
  std::vector<Key> keys;
  const char* parseLine = nullptr;  // logged by every accepted string of the values
  const char* prefix = "";          // further members of every string
};

const std::vector<Sensor> kTable = {
    {.name = "PHYAC",
     .keys = {{"mode", Rule::allOne, 41, 0, {1, 1, 1}},
              {"logN", Rule::minimum, 43, 0, {4, 4, 2}},
              {"logM", Rule::minimum, 44, 0, {1, 2, 1}},
              {"classMask", Rule::bitOr, 42, -1, {1, 6, 8}}}},
    {.name = "STAP",
     .keys = {{"classMask", Rule::bitOr, 101, 3, {1, 2, 1}}, {"level", Rule::minimum, 102, 0, {3, -2, 5}}}},
    {.name = "GSFLK",
     .keys = {{"classMask", Rule::bitOr, 61, 63, {1, 36, 16}}, {"level", Rule::minimum, 62, 0, {5, -5, 4}}}},
    {.name = "SHAKI", .keys = {{"sensitivity", Rule::maximum, 81, 1, {0, 2, 0}}}},
    {.name = "ISACT", .keys = {{"classMask", Rule::bitOr, 151, 15, {8, 1, 8}}}},
    {.name = "SCOUN",
     .keys = {{"mode", Rule::allOne, 141, 1, {1, 0, 1}}, {"logN", Rule::minimum, 142, 1, {50, 7, 100}}}},
    {.name = "GSPX", .keys = {{"classMask", Rule::bitOr, 0, 65535, {1, 2, 4}}}},
    {.name = "DTWGS",
     .keys = {{"classMask", Rule::bitOr, 0, 0, {1, 2, 3}}, {"level", Rule::minimum, 121, 0, {1, -1, 0}}},
     .prefix = R"("mode": 4, "template1": "0003a1b2c3", "template2": "0001ff", )"},
    {.name = "GSETH", .keys = {{"classMask", Rule::bitOr, 161, 3, {1, 1, 2}}}},
    {.name = "LPE_P", .keys = {{"interval", Rule::lastWins, 0, 5000, {-1, 10, 20}}}},
    {.name = "PDR",
     .keys = {{"userHeight", Rule::clonedWins, 181, 1000, {100, 200, 300}},
              {"floorHeight", Rule::clonedWins, 182, 5000, {200, 500, 800}},
              {"initX", Rule::clonedWins, 183, 32767, {-1, 2, -3}},
              {"initY", Rule::clonedWins, 184, 32767, {4, -5, 6}},
              {"initFloor", Rule::clonedWins, 185, 32767, {0, 1, 99}},
              {"N", Rule::minimum, 186, 0, {6, 3, 4}},
              {"6DOF", Rule::clonedWins, 187, 2, {1, 0, 1}}}},
    {.name = "LIFT",
     .keys = {{"classMask", Rule::bitOr, 201, 3, {3, 3, 3}}},
     .parseLine = "tapping: invalid clsmask value 3"},
};

using Settings = std::vector<int32_t>;  // by key

int32_t merged(Rule rule, int32_t cloned, std::span<const int32_t> all) {
  switch (rule) {
    case Rule::allOne:
      return std::all_of(all.begin(), all.end(), [](int32_t value) { return value == 1; }) ? 1 : 0;
    case Rule::bitOr:
      return std::accumulate(all.begin(), all.end(), 0, [](int32_t a, int32_t b) { return a | b; });
    case Rule::clonedWins:
      return cloned;
    case Rule::lastWins:
      return all.back();
    case Rule::maximum:
      return *std::max_element(all.begin(), all.end());
    case Rule::minimum:
      return *std::min_element(all.begin(), all.end());
  }
  return 0;
}

// The list for these sessions' settings, in opening order, when the merge starts from the one at `cloned`.
Properties expectedList(const Sensor& sensor, const std::vector<Settings>& sessions, size_t cloned) {
  std::vector<Settings> byKey(sensor.keys.size());
  Settings values;
  for (size_t k = 0; k < sensor.keys.size(); ++k) {
    for (const Settings& session : sessions) byKey[k].push_back(session[k]);
    values.push_back(merged(sensor.keys[k].rule, sessions[cloned][k], byKey[k]));
  }

  const std::string name = sensor.name;
  if (name == "GSPX") return {};
  if (name == "PHYAC") {
    const auto& spans = byKey[1];
    const auto [smallest, largest] = std::minmax_element(spans.begin(), spans.end());
    return properties({{41, *smallest == *largest ? values[0] : 0},
                       {43, ((1 << *largest) << 16) | (1 << *smallest)},
                       {44, (1 << *smallest) >> values[2]},
                       {42, values[3]}});
  }
  if (name == "DTWGS") {
    Properties list = {property(121, values[1])};
    if (values[0] & 1) list.insert(list.end(), {property(122, 0), {123, {0xA1, 0xB2, 0xC3}}});
    if (values[0] & 2) list.insert(list.end(), {property(122, 1), {123, {0xFF}}});
    return list;
  }
  Properties list;
  for (size_t k = 0; k < values.size(); ++k) list.push_back(property(sensor.keys[k].id, values[k]));
  return list;
}

std::string text(const Sensor& sensor, size_t session) {
  std::string members = sensor.prefix;
  for (const Key& key : sensor.keys) {
    members += (&key == sensor.keys.data() ? "\"" : ", \"") + std::string(key.name) +
               "\": " + std::to_string(key.values[session]);
  }
  return "{" + members + "}";
}

Settings settings(const Sensor& sensor, size_t session) {
  Settings values;
  for (const Key& key : sensor.keys) values.push_back(key.values[session]);
  return values;
}

Settings unsetSettings(const Sensor& sensor) {
  Settings values;
  for (const Key& key : sensor.keys) values.push_back(key.unset);
  return values;
}

Log parseLog(const Sensor& sensor) {
  return sensor.parseLine != nullptr ? Log{error(sensor.parseLine)} : Log{};
}

// Opens `setting.size()` sessions, sets their options and closes them in these orders.
void negotiateAndClose(const Sensor& sensor, const std::vector<size_t>& setting, const std::vector<size_t>& closing) {
  SCOPED_TRACE("set in order " + ::testing::PrintToString(setting) + ", closed in order " +
               ::testing::PrintToString(closing));
  std::vector<void*> handles;
  for (size_t i = 0; i < setting.size(); ++i) handles.push_back(ctx_open_session(sensor.name));
  std::vector<Settings> current(setting.size(), unsetSettings(sensor));
  platform().takeLog();

  for (const size_t session : setting) {
    current[session] = settings(sensor, session);
    EXPECT_EQ(setOption(handles[session], text(sensor, session)),
              (Negotiated{0, expectedList(sensor, current, session)}));
    EXPECT_EQ(platform().takeLog(), parseLog(sensor) + negotiation(sensor.name, handles));
  }

  std::vector<void*> remaining = handles;
  for (const size_t session : closing) {
    const auto at = std::find(remaining.begin(), remaining.end(), handles[session]) - remaining.begin();
    remaining.erase(remaining.begin() + at);
    current.erase(current.begin() + at);
    const Negotiated outcome = closeSession(handles[session]);
    if (remaining.empty()) {
      EXPECT_EQ(outcome, kStopped);
    } else {
      EXPECT_EQ(outcome, (Negotiated{1, expectedList(sensor, current, 0)}));
      EXPECT_EQ(platform().takeLog(), negotiation(sensor.name, remaining));
    }
  }
}

class Negotiation : public ::testing::TestWithParam<const char*> {
 protected:
  const Sensor& sensor() const {
    return *std::find_if(kTable.begin(), kTable.end(),
                         [](const Sensor& row) { return row.name == std::string(GetParam()); });
  }
};

TEST_P(Negotiation, MergesAllOptionsAtEverySettingAndClosing) {
  for (size_t count = 1; count <= kMostSessions; ++count) {
    std::vector<size_t> setting(count);
    std::iota(setting.begin(), setting.end(), size_t{0});
    do {
      std::vector<size_t> closing(count);
      std::iota(closing.begin(), closing.end(), size_t{0});
      do {
        negotiateAndClose(sensor(), setting, closing);
      } while (std::next_permutation(closing.begin(), closing.end()) && !HasFailure());
    } while (std::next_permutation(setting.begin(), setting.end()) && !HasFailure());
  }
}

TEST_P(Negotiation, ListKeepsItsValuesUntilTheNextOne) {
  void* const first = ctx_open_session(sensor().name);
  void* const second = ctx_open_session(sensor().name);
  const auto [result, list] = setAndKeep(first, text(sensor(), 0));
  ASSERT_EQ(result, 0);
  const Properties values = read(list);
  EXPECT_EQ(values, expectedList(sensor(), {settings(sensor(), 0), unsetSettings(sensor())}, 0));

  dispatch(first, activity(9, {0x0011, 0x0022}));
  dispatch(second, Bytes(64, 0xFF));
  void* const third = ctx_open_session(sensor().name);
  EXPECT_EQ(ctx_set_option(second, 0, nullptr, nullptr), -1);
  EXPECT_EQ(read(list), values);

  EXPECT_EQ(closeSession(third).result, 1);  // stale from here on, but released without harm
  EXPECT_EQ(closeSession(second).result, 1);
  EXPECT_EQ(closeSession(first), kStopped);
}

// "SCOUN" and "ISACT" take any string, and so negotiate once more, with nothing changed.
TEST_P(Negotiation, StringThatIsNoJsonChangesNothing) {
  const std::string name = sensor().name;
  void* const first = ctx_open_session(sensor().name);
  void* const second = ctx_open_session(sensor().name);
  EXPECT_EQ(setOption(second, text(sensor(), 1)).result, 0);
  const auto [result, list] = setAndKeep(first, text(sensor(), 0));
  ASSERT_EQ(result, 0);
  const Properties values = read(list);
  platform().takeLog();

  const Negotiated outcome = setOption(first, "{\"classMask\": 1");
  const auto negotiated = [](const Log& log) {
    return std::count_if(log.begin(), log.end(), [](const LogLine& line) { return line.tag == "Libsl"; });
  };
  if (name == "SCOUN" || name == "ISACT") {
    EXPECT_EQ(outcome, (Negotiated{0, values}));
    EXPECT_EQ(negotiated(platform().takeLog()), 2);
  } else {
    EXPECT_EQ(outcome, kFailed);
    EXPECT_EQ(negotiated(platform().takeLog()), 0);
    EXPECT_EQ(read(list), values);
  }
  EXPECT_EQ(closeSession(second), (Negotiated{1, expectedList(sensor(), {settings(sensor(), 0)}, 0)}));
  EXPECT_EQ(closeSession(first), kStopped);
}

INSTANTIATE_TEST_SUITE_P(Of, Negotiation, ::testing::ValuesIn(kSensors), sensorName);

TEST(Sensors, NegotiateApartFromEachOther) {
  void* const tapping = ctx_open_session("STAP");
  const auto [tappingResult, taps] = setAndKeep(tapping, R"({"classMask": 1})");
  void* const flick = ctx_open_session("GSFLK");
  const auto [flickResult, flicks] = setAndKeep(flick, R"({"classMask": 2})");
  EXPECT_EQ(tappingResult, 0);
  EXPECT_EQ(flickResult, 0);
  EXPECT_EQ(platform().takeLog(), negotiation("STAP", {tapping}) + negotiation("GSFLK", {flick}));
  EXPECT_EQ(read(taps), properties({{101, 1}, {102, 0}}));
  EXPECT_EQ(closeSession(flick), kStopped);
  EXPECT_EQ(read(taps), properties({{101, 1}, {102, 0}}));
  EXPECT_EQ(closeSession(tapping), kStopped);
}

}  // namespace
}  // namespace api
