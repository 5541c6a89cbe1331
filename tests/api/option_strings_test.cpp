#include "client.h"

// What every sensor makes of option strings: the one session's result, property list and log lines.
namespace api {
namespace {

struct Case {
  std::string text;
  Negotiated outcome;
  Log log;  // of the parsing; a negotiation adds its own line
};

Negotiated accepted(Properties list) {
  return {0, std::move(list)};
}

struct Sensor {
  const char* name;
  std::vector<Case> cases;
};

// The strings of every sensor with a mask from 1 to `largest`.
std::vector<Case> maskCases(int32_t id, int32_t largest, const std::string& message, const char* tag = "libsenseloom") {
  const auto taken = [&](const std::string& value, int32_t as) -> Case {
    return {R"({"classMask": )" + value + "}", accepted(properties({{id, as}})), {}};
  };
  const auto rejected = [&](int32_t value) -> Case {
    return {R"({"classMask": )" + std::to_string(value) + "}",
            accepted(properties({{id, largest}})),
            {{kError, tag, message + std::to_string(value)}}};
  };
  return {taken("1", 1),
          taken(std::to_string(largest), largest),
          taken(std::to_string(largest - 1), largest - 1),
          taken(R"("1")", largest),
          taken("1.0", largest),
          taken("true", largest),
          taken("null", largest),
          taken("[1]", largest),
          taken("4294967297", 1),  // cut to 32 bits
          taken("1, \"unknown\": 7", 1),
          rejected(0),
          rejected(-1),
          rejected(largest + 1),
          rejected(INT32_MAX),
          rejected(INT32_MIN),
          {"{}", accepted(properties({{id, largest}})), {}},
          {"[1]", accepted(properties({{id, largest}})), {}}};  // JSON without members
}

Properties activityList(int32_t mode, int32_t largestSpan, int32_t smallestSpan, int32_t decisions, int32_t mask) {
  return properties({{41, mode},
                     {43, static_cast<int32_t>(static_cast<uint32_t>(largestSpan) << 16) | smallestSpan},
                     {44, decisions},
                     {42, mask}});
}
const Properties kActivityDefaults = activityList(0, 1, 1, 1, -1);

std::vector<Case> activityCases() {
  const std::vector<std::pair<const char*, Properties>> lists = {
      {"{}", kActivityDefaults},
      {"[]", kActivityDefaults},
      {R"({"unknown": 3})", kActivityDefaults},
      {R"({"mode": 1})", activityList(1, 1, 1, 1, -1)},
      {R"({"mode": 2})", kActivityDefaults},  // merged with itself: only 1 stays
      {R"({"mode": -1})", kActivityDefaults},
      {R"({"logN": 3})", activityList(0, 8, 8, 8, -1)},
      {R"({"logN": 8})", activityList(0, 256, 256, 256, -1)},
      {R"({"logN": 9})", activityList(0, 512, 256, 256, -1)},
      {R"({"logN": 12})", activityList(0, 4096, 256, 256, -1)},
      {R"({"logN": 16})", activityList(0, 0, 256, 256, -1)},  // 1 << 16 leaves the upper half
      {R"({"logN": 33})", activityList(0, 2, 256, 256, -1)},  // shifts count modulo 32
      {R"({"logN": -1})", kActivityDefaults},
      {R"({"logN": 4294967299})", activityList(0, 8, 8, 8, -1)},  // cut to 32 bits
      {R"({"logN": "3"})", kActivityDefaults},
      {R"({"logN": 3.0})", kActivityDefaults},
      {R"({"logN": true})", kActivityDefaults},
      {R"({"logN": null})", kActivityDefaults},
      {R"({"logN": 3, "logM": 5})", activityList(0, 8, 8, 1, -1)},
      {R"({"logN": 3, "logM": 2})", activityList(0, 8, 8, 2, -1)},
      {R"({"logN": 3, "logM": -1})", activityList(0, 8, 8, 8, -1)},
      {R"({"logN": 100, "logM": 9})", activityList(0, 16, 256, 1, -1)},  // 100 % 32 is 4
      {R"({"classMask": 0})", activityList(0, 1, 1, 1, 0)},
      {R"({"classMask": 255})", activityList(0, 1, 1, 1, 255)},
      {R"({"classMask": 256})", kActivityDefaults},
      {R"({"classMask": -2})", kActivityDefaults},
      {R"({"summary": 7, "weightVar": -5, "continuous": 7})", kActivityDefaults},
  };
  std::vector<Case> cases;
  for (const auto& [text, list] : lists) cases.push_back({text, accepted(list), {}});
  return cases;
}

Properties deadReckoningList(std::array<int32_t, 7> values) {
  return properties({{181, values[0]},
                     {182, values[1]},
                     {183, values[2]},
                     {184, values[3]},
                     {185, values[4]},
                     {186, values[5]},
                     {187, values[6]}});
}

std::vector<Case> deadReckoningCases() {
  const LogLine noUserHeight = error("PDR: invalid user height value 1000");
  const LogLine noFloorHeight = error("PDR: invalid floor height value 5000");
  const LogLine no6DOF = error("PDR: invalid 6DOF value 2");
  constexpr int32_t kNone = 32767;
  const auto heights = [](int user, int floor) {
    return R"({"userHeight": )" + std::to_string(user) + R"(, "floorHeight": )" + std::to_string(floor) +
           R"(, "6DOF": 1})";
  };
  const auto list = [](int32_t user, int32_t floor) {
    return accepted(deadReckoningList({user, floor, kNone, kNone, kNone, 0, 1}));
  };
  const auto counts = [](int n, int sixDOF) {
    return R"({"userHeight": 200, "floorHeight": 300, "initX": -7, "initY": 8, "initFloor": 2147483648, "N": )" +
           std::to_string(n) + R"(, "6DOF": )" + std::to_string(sixDOF) + "}";
  };
  const auto countsList = [](int32_t n, int32_t sixDOF) {
    return accepted(deadReckoningList({200, 300, -7, 8, INT32_MIN, n, sixDOF}));
  };
  return {
      {"{}",
       accepted(deadReckoningList({1000, 5000, kNone, kNone, kNone, 0, 2})),
       {noUserHeight, noFloorHeight, no6DOF}},
      {R"({"userHeight": "200", "N": 6.0, "6DOF": false})",
       accepted(deadReckoningList({1000, 5000, kNone, kNone, kNone, 0, 2})),
       {noUserHeight, noFloorHeight, no6DOF}},
      {heights(100, 200), list(100, 200), {}},
      {heights(300, 800), list(300, 800), {}},
      {heights(99, 199),
       list(1000, 5000),
       {error("PDR: invalid user height value 99"), error("PDR: invalid floor height value 199")}},
      {heights(301, 801),
       list(1000, 5000),
       {error("PDR: invalid user height value 301"), error("PDR: invalid floor height value 801")}},
      {heights(INT32_MIN, -1),
       list(1000, 5000),
       {error("PDR: invalid user height value -2147483648"), error("PDR: invalid floor height value -1")}},
      {counts(6, 0), countsList(6, 0), {}},
      {counts(7, 1), countsList(0, 1), {error("PDR: invalid N value 7")}},
      {counts(-1, -1), countsList(0, 2), {error("PDR: invalid N value -1"), error("PDR: invalid 6DOF value -1")}},
      {counts(1, 2), countsList(1, 2), {error("PDR: invalid 6DOF value 2")}},
  };
}

const std::vector<Sensor>& table() {
  static const std::vector<Sensor> kTable = {
      {"PHYAC", activityCases() + std::vector<Case>{{"{", kFailed, {}}, {"", kFailed, {}}, {"3", kFailed, {}}}},
      {"STAP",
       {{"{}", accepted(properties({{101, 3}, {102, 0}})), {}},
        {R"({"classMask": 2, "level": 5})", accepted(properties({{101, 2}, {102, 5}})), {}},
        {R"({"classMask": 1, "level": -5})", accepted(properties({{101, 1}, {102, -5}})), {}},
        {R"({"classMask": 4, "level": 1})",
         accepted(properties({{101, 3}, {102, 1}})),
         {error("tapping: invalid clsmask value 4")}},
        {R"({"classMask": 0})",
         accepted(properties({{101, 3}, {102, 0}})),
         {error("tapping: invalid clsmask value 0")}},
        {R"({"classMask": -1})",
         accepted(properties({{101, 3}, {102, 0}})),
         {error("tapping: invalid clsmask value -1")}},
        {R"({"classMask": 1, "level": 6})",
         accepted(properties({{101, 0}, {102, 6}})),
         {error("tapping: invalid level value 6")}},
        {R"({"classMask": 9, "level": -6})",
         accepted(properties({{101, 0}, {102, -6}})),
         {error("tapping: invalid clsmask value 9"), error("tapping: invalid level value -6")}},
        {R"({"classMask": "1", "level": 2.0})", accepted(properties({{101, 3}, {102, 0}})), {}},
        {"{", kFailed, {}}}},
      {"GSFLK",
       {{"{}", accepted(properties({{61, 63}, {62, 0}})), {}},
        {R"({"classMask": 1, "level": 5})", accepted(properties({{61, 1}, {62, 5}})), {}},
        {R"({"classMask": 64, "level": -5})",
         accepted(properties({{61, 63}, {62, -5}})),
         {error("gestureflick: invalid clsmask value 64")}},
        {R"({"classMask": 0})",
         accepted(properties({{61, 63}, {62, 0}})),
         {error("gestureflick: invalid clsmask value 0")}},
        {R"({"classMask": 5, "level": -6})",
         accepted(properties({{61, 5}, {62, 0}})),
         {error("gestureflick: invalid level value -6")}},
        {R"({"classMask": -1, "level": 6})",
         accepted(properties({{61, 63}, {62, 0}})),
         {error("gestureflick: invalid clsmask value -1"), error("gestureflick: invalid level value 6")}},
        {"{,", kFailed, {error("gestureflick: invalid opton string {,, all set as default")}}}},
      {"SHAKI",
       {{"{}", accepted(properties({{81, 1}})), {}},
        {R"({"sensitivity": 0})", accepted(properties({{81, 0}})), {}},
        {R"({"sensitivity": 2})", accepted(properties({{81, 2}})), {}},
        {R"({"sensitivity": 3})", accepted(properties({{81, 1}})), {error("shaking: invalid clsmask value 3")}},
        {R"({"sensitivity": -1})", accepted(properties({{81, 1}})), {error("shaking: invalid clsmask value -1")}},
        {R"({"classMask": 2})", accepted(properties({{81, 1}})), {}},
        {"", kFailed, {error("shaking: invalid opton string , all set as default")}}}},
      {"ISACT",
       maskCases(151, 15, "instantactivity: invalid clsmask value ", "STY") +
           std::vector<Case>{{"%s {",
                              accepted(properties({{151, 15}})),
                              {{kError, "STY", "instantactivity: invalid opton string %s {, all set as default"}}}}},
      {"SCOUN",
       {{"{}", accepted(properties({{141, 1}, {142, 1}})), {}},
        {R"({"mode": 0, "logN": 100})", accepted(properties({{141, 0}, {142, 100}})), {}},
        {R"({"mode": 2, "logN": 101})", accepted(properties({{141, 1}, {142, 100}})), {}},
        {R"({"mode": -1, "logN": 0})", accepted(properties({{141, 1}, {142, 1}})), {}},
        {R"({"mode": 0, "logN": -3})", accepted(properties({{141, 0}, {142, 1}})), {}},
        {R"({"mode": false, "logN": "7"})", accepted(properties({{141, 1}, {142, 1}})), {}},
        {"{", accepted(properties({{141, 1}, {142, 1}})), {}}}},
      {"GSPX",
       {{"{}", accepted({}), {}},
        {R"({"classMask": 1})", accepted({}), {}},
        {R"({"classMask": 65535})", accepted({}), {}},
        {R"({"classMask": 65536})", accepted({}), {error("gesture hmm: invalid clsmask value 65536")}},
        {R"({"classMask": 0})", accepted({}), {error("gesture hmm: invalid clsmask value 0")}},
        {"nil", kFailed, {error("gesture hmm: invalid opton string nil, all set as default")}}}},
      {"DTWGS",
       {{"{", kFailed, {}},
        {"{}", kFailed, {error("Invalid mode value 0")}},
        {R"({"mode": 2, "classMask": 1})", kFailed, {error("Invalid mode value 2")}},
        {R"({"mode": 5, "classMask": 1})", kFailed, {error("Invalid mode value 5")}},
        {R"({"mode": -1, "classMask": 1})", kFailed, {error("Invalid mode value -1")}},
        {R"({"mode": "4", "classMask": 1})", kFailed, {error("Invalid mode value 0")}},
        {R"({"mode": 1})", accepted({}), {}},
        {R"({"mode": 1, "classMask": 9, "level": 2, "index": 1})", accepted({}), {}},
        {R"({"mode": 1, "index": 2})", kFailed, {error("Invalid index value 2 at enroll mode")}},
        {R"({"mode": 1, "classMask": 1, "index": -1})", kFailed, {error("Invalid index value -1 at enroll mode")}},
        {R"({"mode": 4})", kFailed, {error("Invalid mask value 0 at match mode")}},
        {R"({"mode": 4, "classMask": 4, "level": 9})", kFailed, {error("Invalid mask value 4 at match mode")}},
        {R"({"mode": 4, "classMask": -1})", kFailed, {error("Invalid mask value -1 at match mode")}},
        {R"({"mode": 4, "classMask": 1, "level": 2})", kFailed, {error("Invalid level value 2 at match mode")}},
        {R"({"mode": 4, "classMask": 3, "level": -2})", kFailed, {error("Invalid level value -2 at match mode")}},
        {R"({"mode": 4, "classMask": 1, "level": -1})", accepted(properties({{121, -1}})), {}},
        {R"({"mode": 4, "classMask": 3, "level": 1, "index": 7})", accepted(properties({{121, 1}})), {}}}},
      {"GSETH", maskCases(161, 3, "gesture eartouch: invalid clsmask value ") +
                    std::vector<Case>{
                        {"{]", kFailed, {error("gesture eartouch: invalid opton string {], all set as default")}}}},
      {"LPE_P",
       {{"{}", accepted(properties({{0, 5000}})), {}},
        {R"({"interval": -1})", accepted(properties({{0, -1}})), {}},
        {R"({"interval": 0})", accepted(properties({{0, 0}})), {}},
        {R"({"interval": 4294967295})", accepted(properties({{0, -1}})), {}},
        {R"({"interval": "9"})", accepted(properties({{0, 5000}})), {}},
        {"no JSON", kFailed, {error("audio : invalid opton string no JSON, all set as default")}}}},
      {"PDR", deadReckoningCases() + std::vector<Case>{{"{", kFailed, {}}}},
      {"LIFT",
       {{"{}", accepted(properties({{201, 3}})), {error("tapping: invalid clsmask value 3")}},
        {R"({"classMask": 1})", accepted(properties({{201, 3}})), {error("tapping: invalid clsmask value 1")}},
        {R"({"classMask": -9})", accepted(properties({{201, 3}})), {error("tapping: invalid clsmask value -9")}},
        {R"({"classMask": "1"})", accepted(properties({{201, 3}})), {error("tapping: invalid clsmask value 3")}},
        {"{", kFailed, {}}}},
  };
  return kTable;
}

class OptionStrings : public ::testing::TestWithParam<const char*> {};

TEST_P(OptionStrings, AreReadLoggedAndRendered) {
  const auto sensor = std::find_if(table().begin(), table().end(),
                                   [](const Sensor& row) { return row.name == std::string(GetParam()); });
  for (const auto& [text, outcome, log] : sensor->cases) {
    SCOPED_TRACE(text);
    void* const handle = ctx_open_session(sensor->name);
    platform().takeLog();
    EXPECT_EQ(setOption(handle, text), outcome);
    EXPECT_EQ(platform().takeLog(), outcome == kFailed ? log : log + negotiation(sensor->name, {handle}));
    EXPECT_EQ(closeSession(handle), kStopped);
  }
}

TEST_P(OptionStrings, MissingKeysGoBackToTheirDefaults) {
  const auto sensor = std::find_if(table().begin(), table().end(),
                                   [](const Sensor& row) { return row.name == std::string(GetParam()); });
  void* const handle = ctx_open_session(sensor->name);
  for (const auto& [text, outcome, log] : sensor->cases) {
    if (outcome == kFailed || text.front() != '{' || text.back() != '}') continue;
    SCOPED_TRACE(text);
    EXPECT_EQ(setOption(handle, text), outcome);  // whatever the strings before have set
  }
  EXPECT_EQ(closeSession(handle), kStopped);
}

INSTANTIATE_TEST_SUITE_P(Of, OptionStrings, ::testing::ValuesIn(kSensors), sensorName);

}  // namespace
}  // namespace api
