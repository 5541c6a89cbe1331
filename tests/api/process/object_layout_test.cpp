#include <gtest/gtest.h>
#include <senseloom.h>

#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

// Objects of the library as those see them who were compiled against the layout of its classes.
namespace {

template <class Function>
Function slot(void* object, size_t index) {
  return reinterpret_cast<Function>((*static_cast<void***>(object))[index]);
}

struct Option {
  void** functions;
  int32_t* settings() { return reinterpret_cast<int32_t*>(this + 1); }
};
struct Session {
  void** functions;
  const char* name;
  Option* option;
  void* proc;
};
struct Sensor {
  void** functions;
  Option* mergedOption;
  Session** sessions;  // the first of them
};

// Slots 1 and 2 are the destructors, the second of which frees the object, too.
using Delete = void (*)(void*);
using CreateSession = Session* (*)(Sensor*);
using Start = bool (*)(Sensor*);

Session* open(const char* sensor) {
  return static_cast<Session*>(ctx_open_session(sensor));
}
Sensor* sensorOf(const char* name) {
  return static_cast<Sensor*>(getSensor(name));
}

// A property list that is released with its test.
struct List {
  ~List() { ctx_option_release(list); }
  List() = default;
  List(const List&) = delete;
  List& operator=(const List&) = delete;
  ctx_property_t* properties() const { return list->properties; }
  ctx_option_t* list = nullptr;
};

int setOption(Session* session, const std::string& text, List& list) {
  return ctx_set_option(session, 0, text.c_str(), &list.list);
}
void close(Session* session) {
  List list;
  EXPECT_GE(ctx_close_session(session, &list.list), 0);
}
void set(Session* session, const std::string& text) {
  List list;
  EXPECT_EQ(setOption(session, text, list), 0) << text;
}

// Dispatches a record with this 16-bit value, and zeros behind it. Returns the result's value; -1 when there is none.
int dispatch(Session* session, int16_t value) {
  uint8_t record[64] = {};
  std::memcpy(record + 8, &value, sizeof value);
  void* out = nullptr;
  int length = 0;
  if (ctx_dispatch_data(session, record, sizeof record, &out, &length) != 1) {
    EXPECT_EQ(out, nullptr);
    return -1;
  }
  std::memcpy(&value, static_cast<char*>(out) + 8, sizeof value);
  return value;
}

const char* const kSensors[] = {"PHYAC", "STAP",  "GSFLK", "SHAKI", "ISACT", "SCOUN",
                                "GSPX",  "DTWGS", "GSETH", "LPE_P", "PDR",   "LIFT"};

TEST(SensorLayout, ThirdFunctionReturnsANewSession) {
  ctx_open_session("none");
  for (const char* name : kSensors) {
    Sensor* const sensor = sensorOf(name);
    auto* const session = slot<CreateSession>(sensor, 2)(sensor);
    EXPECT_STREQ(session->name, name);
    EXPECT_NE(session->option, nullptr) << name;
    EXPECT_EQ(session->proc, nullptr) << name;
    EXPECT_EQ(sensor->sessions, nullptr) << name << ": nobody has opened it";
    slot<Delete>(session, 1)(session);
  }
}

TEST(SensorLayout, FourthAndFifthFunctionStartAndStopTheSensor) {
  ctx_open_session("none");
  Sensor* const sensor = sensorOf("LPE_P");
  EXPECT_TRUE(slot<Start>(sensor, 3)(sensor));
  EXPECT_TRUE(gIsActivated);
  EXPECT_TRUE(slot<Start>(sensor, 4)(sensor));
  EXPECT_FALSE(gIsActivated);
}

TEST(SensorLayout, MergedOptionComesBeforeTheSessionsInTheirOrder) {
  Session* const first = open("STAP");
  Session* const second = open("STAP");
  Sensor* const sensor = sensorOf("STAP");
  EXPECT_EQ(sensor->mergedOption, nullptr);
  set(first, R"({"classMask":1,"level":-2})");
  ASSERT_NE(sensor->mergedOption, nullptr);
  EXPECT_EQ(sensor->mergedOption->settings()[0], 3);
  EXPECT_EQ(sensor->mergedOption->settings()[1], -2);
  EXPECT_EQ(sensor->sessions[0], first);
  EXPECT_EQ(sensor->sessions[1], second);
  close(first);
  close(second);
}

TEST(SessionLayout, NameOptionAndChainFollowTheFunctions) {
  Session* const session = open("PHYAC");
  EXPECT_STREQ(session->name, "PHYAC");
  EXPECT_EQ(session->proc, nullptr);
  set(session, R"({"mode":1,"logN":2})");
  EXPECT_EQ(session->option->settings()[0], 1);
  EXPECT_EQ(session->option->settings()[1], 2);
  EXPECT_NE(session->proc, nullptr);
  close(session);
}

struct OptionCase {
  const char* sensor;
  const char* text;
  std::vector<int32_t> settings;  // as they follow each other
};

TEST(OptionLayout, SettingsFollowTheFunctionsInTheirOrder) {
  const OptionCase cases[] = {
      {"PHYAC", R"({"mode":7,"logN":2})", {7, 2}},  // the rest is in an order of its own
      {"STAP", R"({"level":-2,"classMask":1})", {1, -2}},
      {"GSFLK", R"({"level":4,"classMask":5})", {5, 4}},
      {"SHAKI", R"({"sensitivity":2})", {2}},
      {"ISACT", R"({"classMask":9})", {9}},
      {"SCOUN", R"({"logN":33,"mode":0})", {0, 33}},
      {"GSPX", R"({"classMask":1025})", {1025}},
      {"DTWGS", R"({"index":9,"level":-1,"classMask":2,"mode":4})", {4, 2, -1, 9}},
      {"GSETH", R"({"classMask":2})", {2}},
      {"LPE_P", R"({"interval":-3})", {-3}},
      {"PDR",
       R"({"6DOF":1,"N":3,"initFloor":6,"initY":5,"initX":4,"floorHeight":300,"userHeight":170})",
       {170, 300, 4, 5, 6, 3, 1}},
      {"LIFT", R"({"classMask":1})", {3}},
  };
  for (const auto& [sensor, text, settings] : cases) {
    Session* const session = open(sensor);
    set(session, text);
    const int32_t* const stored = session->option->settings();
    EXPECT_EQ(std::vector<int32_t>(stored, stored + settings.size()), settings) << sensor;
    close(session);
  }
}

TEST(OptionLayout, ListsPointBehindTheSettingsOfTheMergedOption) {
  const struct {
    const char* sensor;
    int32_t settings;
    int32_t properties;
  } kinds[] = {{"STAP", 2, 2},  {"GSFLK", 2, 2}, {"SHAKI", 1, 1}, {"ISACT", 1, 1}, {"SCOUN", 2, 2},
               {"GSETH", 1, 1}, {"LPE_P", 1, 1}, {"PDR", 7, 7},   {"LIFT", 1, 1}};
  for (const auto& [sensor, settings, properties] : kinds) {
    Session* const session = open(sensor);
    List list;
    ASSERT_EQ(setOption(session, "{}", list), 0) << sensor;
    ASSERT_EQ(list.list->count, properties) << sensor;
    int32_t* const mirrors = sensorOf(sensor)->mergedOption->settings() + settings;
    for (int32_t i = 0; i < properties; ++i) EXPECT_EQ(list.properties()[i].value, mirrors + i) << sensor << ' ' << i;
    close(session);
  }
}

TEST(TemplateStore, HoldsTwiceNineHundredBytesAndTheirLength) {
  Session* const session = open("DTWGS");
  List list;
  ASSERT_EQ(setOption(session, R"({"mode":4,"classMask":3,"template1":"0003a1b2c3","template2":"0384ff"})", list), 0);
  ASSERT_EQ(list.list->count, 5);
  const auto* const first = static_cast<uint8_t*>(list.properties()[2].value);
  const auto* const second = static_cast<uint8_t*>(list.properties()[4].value);
  EXPECT_EQ(second - first, 904);
  EXPECT_EQ(*reinterpret_cast<const int32_t*>(first + 900), 3);
  EXPECT_EQ(*reinterpret_cast<const int32_t*>(second + 900), 900);
  EXPECT_EQ(first[2], 0xC3);
  EXPECT_EQ(second[0], 0xFF);
  close(session);
}

// --- what only a setting can bring about that no string leads to

TEST(StepCountSession, InAnUnknownModeDeliversNothing) {
  Session* const session = open("SCOUN");
  int32_t& mode = session->option->settings()[0];
  for (const int32_t unknown : {2, -1, 3}) {
    mode = unknown;
    EXPECT_EQ(dispatch(session, 100), -1) << unknown;
  }
  mode = 1;
  EXPECT_EQ(dispatch(session, 7), 7);
  mode = 0;
  EXPECT_EQ(dispatch(session, 100), 100);
  close(session);
}

TEST(DeadReckoningSession, TakesItsNumberOfItemsModulo32) {
  Session* const session = open("PDR");
  int32_t& N = session->option->settings()[5];
  N = 33;  // two items
  EXPECT_EQ(dispatch(session, 1), -1);
  EXPECT_EQ(dispatch(session, 1), 2);
  for (const int32_t one : {32, -32, 64}) {
    N = one;
    EXPECT_EQ(dispatch(session, 1), 1) << one;
  }
  N = -30;  // four items
  for (int pending = 1; pending < 4; ++pending) EXPECT_EQ(dispatch(session, 1), -1);
  EXPECT_EQ(dispatch(session, 1), 4);
  N = 31;  // a negative number
  EXPECT_EQ(dispatch(session, 0), 0);
  close(session);
}

TEST(LiftOption, IsMergedByOr) {
  Session* const first = open("LIFT");
  Session* const second = open("LIFT");
  Session* const leaving = open("LIFT");
  first->option->settings()[0] = 5;
  second->option->settings()[0] = 10;
  List list;
  ASSERT_EQ(ctx_close_session(leaving, &list.list), 1);
  ASSERT_EQ(list.list->count, 1);
  EXPECT_EQ(*static_cast<int32_t*>(list.properties()[0].value), 15);
  close(first);
  close(second);
}

}  // namespace
