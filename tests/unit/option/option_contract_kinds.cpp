#include "option_contract_kinds.h"

#include <limits>

#include "option/option_kinds.h"

namespace senseloom {
namespace {

constexpr int32_t kMin = std::numeric_limits<int32_t>::min();
constexpr int32_t kMax = std::numeric_limits<int32_t>::max();

constexpr Range kAny = {kMin, kMax};
constexpr Range kNone = {1, 0};

constexpr OutOfRange kReplaced = OutOfRange::replaced;
constexpr OutOfRange kClamped = OutOfRange::clamped;
constexpr OutOfRange kKept = OutOfRange::kept;

template <class Class>
std::unique_ptr<Option> make() {
  return std::make_unique<Class>();
}

template <class Class, auto... kGetters>
Values settings(const Option& option) {
  const auto& concrete = static_cast<const Class&>(option);
  return {(concrete.*kGetters)()...};
}

Kind physicalActivity() {
  using Class = OptionActivity;
  return {
      .sensor = "PHYAC",
      .make = make<Class>,
      .settings = settings<Class, &Class::mode, &Class::logN, &Class::logM, &Class::classMask, &Class::summary,
                           &Class::weightVar, &Class::continuous>,
      .keys = {{"mode", 0, kAny, kReplaced, 0, "", Merge::allOne},
               {"logN", 0, {0, 8}, kClamped, 0, "", Merge::minimum},
               {"logM", 0, {0, 8}, kClamped, 0, "", Merge::minimum},
               {"classMask", -1, {-1, 255}, kReplaced, -1, "", Merge::bitOr},
               {"summary", 1, {0, 1}, kReplaced, 1, "", Merge::keepFirst},
               {"weightVar", -1, {0, kMax}, kReplaced, -1, "", Merge::keepFirst},
               {"continuous", 0, {0, 1}, kReplaced, 1, "", Merge::anySet}},
      .common = {1, 4, 3, 12, 0, 7, 1},
      .properties = {{41, 1}, {43, 0x100010}, {44, 2}, {42, 12}},
      .taken = {{"mode", {kMin, -1, 0, 2, kMax}},
                {"logN", {3, 5, 8}},
                {"logM", {0, 2, 4}},
                {"classMask", {-1, 0, 255}},
                {"summary", {0, 1}},
                {"weightVar", {0, kMax}},
                {"continuous", {0, 1}}},
      .replaced = {{"logN", 8, {9, kMax}},
                   {"logM", 0, {kMin, -1}},
                   {"logM", 4, {5, 8, 9, kMax}},
                   {"classMask", -1, {kMin, -2, 256, kMax}},
                   {"summary", 1, {kMin, -1, 2, 7, kMax}},
                   {"weightVar", -1, {kMin, -5, -1}},
                   {"continuous", 1, {kMin, -1, 2, 7, kMax}}},
      .particular = {{"logN", kMin, {1, 0, 0, 12, 0, 7, 1}},
                     {"logN", -1, {1, 0, 0, 12, 0, 7, 1}},
                     {"logN", 0, {1, 0, 0, 12, 0, 7, 1}},
                     {"logN", 2, {1, 2, 2, 12, 0, 7, 1}}},
      .mergings = {{{1, 3, 2, 1, 0, 7, 0}, {1, 4, 1, 2, 1, 9, 1}, {0, 3, 1, 3, 0, 7, 1}},
                   {{1, 4, 1, 2, 1, 9, 1}, {1, 3, 2, 1, 0, 7, 0}, {0, 3, 1, 3, 1, 9, 1}},
                   {{1, 3, 1, -1, 1, -1, 0}, {1, 3, 3, 1, 0, 0, 0}, {1, 3, 1, -1, 1, -1, 0}},
                   {{2, 0, 0, 0, 0, 0, 1}, {2, 0, 0, 0, 0, 0, 0}, {0, 0, 0, 0, 0, 0, 1}},
                   {{1, 0, 0, 128, 0, 0, 0}, {0, 0, 0, 1, 0, 0, 0}, {0, 0, 0, 129, 0, 0, 0}}},
      .describedIds = {41, 43, 44, 42},
      .describedKeys = {0, -1, -1, 3},
  };
}

Kind tapping() {
  using Class = OptionTapping;
  return {
      .sensor = "STAP",
      .make = make<Class>,
      .settings = settings<Class, &Class::classMask, &Class::level>,
      .keys = {{"classMask", 3, {1, 3}, kReplaced, 3, "tapping: invalid clsmask value %", Merge::bitOr},
               {"level", 0, {-5, 5}, kKept, 0, "tapping: invalid level value %", Merge::minimum}},
      .common = {1, 2},
      .properties = {{101, 1}, {102, 2}},
      .taken = {{"classMask", {1, 2, 3}}, {"level", {-5, 0, 5}}},
      .replaced = {{"classMask", 3, {kMin, -1, 0, 4, kMax}}},
      .particular = {{"level", kMin, {0, kMin}},
                     {"level", -6, {0, -6}},
                     {"level", 6, {0, 6}},
                     {"level", kMax, {0, kMax}}},
      .mergings = {{{1, 3}, {2, -2}, {3, -2}}, {{1, 6}, {2, 5}, {2, 5}}, {{1, 0}, {2, -6}, {1, -6}}},
      .describedIds = {101, 102},
      .describedKeys = {0, 1},
  };
}

Kind flickGesture() {
  using Class = OptionGestureFlick;
  return {
      .sensor = "GSFLK",
      .make = make<Class>,
      .settings = settings<Class, &Class::classMask, &Class::level>,
      .keys = {{"classMask", 63, {1, 63}, kReplaced, 63, "gestureflick: invalid clsmask value %", Merge::bitOr},
               {"level", 0, {-5, 5}, kReplaced, 0, "gestureflick: invalid level value %", Merge::minimum}},
      .common = {12, 2},
      .properties = {{61, 12}, {62, 2}},
      .taken = {{"classMask", {1, 63}}, {"level", {-5, 0, 5}}},
      .replaced = {{"classMask", 63, {kMin, -1, 0, 64, kMax}}, {"level", 0, {kMin, -6, 6, kMax}}},
      .mergings = {{{1, 3}, {32, -2}, {33, -2}}, {{6, -5}, {3, 5}, {7, -5}}},
      .describedIds = {61, 62},
      .describedKeys = {0, 1},
      .unparsable = "gestureflick: invalid opton string %, all set as default",
  };
}

Kind shaking() {
  using Class = OptionShaking;
  return {
      .sensor = "SHAKI",
      .make = make<Class>,
      .settings = settings<Class, &Class::sensitivity>,
      .keys = {{"sensitivity", 1, {0, 2}, kReplaced, 1, "shaking: invalid clsmask value %", Merge::maximum}},
      .common = {2},
      .properties = {{81, 2}},
      .taken = {{"sensitivity", {0, 1, 2}}},
      .replaced = {{"sensitivity", 1, {kMin, -1, 3, kMax}}},
      .mergings = {{{0}, {2}, {2}}, {{2}, {0}, {2}}, {{0}, {0}, {0}}},
      .describedIds = {81},
      .describedKeys = {0},
      .unparsable = "shaking: invalid opton string %, all set as default",
  };
}

Kind instantActivity() {
  using Class = OptionInstantActivity;
  return {
      .sensor = "ISACT",
      .make = make<Class>,
      .settings = settings<Class, &Class::classMask>,
      .keys = {{"classMask", 15, {1, 15}, kReplaced, 15, "instantactivity: invalid clsmask value %", Merge::bitOr}},
      .common = {6},
      .properties = {{151, 6}},
      .taken = {{"classMask", {1, 15}}},
      .replaced = {{"classMask", 15, {kMin, -1, 0, 16, kMax}}},
      .mergings = {{{1}, {8}, {9}}, {{6}, {3}, {7}}},
      .describedIds = {151},
      .describedKeys = {0},
      .tag = "STY",
      .unparsable = "instantactivity: invalid opton string %, all set as default",
      .unparsableResult = 0,
      .nullIsLogged = true,
  };
}

Kind stepCount() {
  using Class = OptionStepCount;
  return {
      .sensor = "SCOUN",
      .make = make<Class>,
      .settings = settings<Class, &Class::mode, &Class::logN>,
      .keys = {{"mode", 1, {0, 1}, kReplaced, 1, "", Merge::allOne},
               {"logN", 1, {1, 100}, kClamped, 1, "", Merge::minimum}},
      .common = {0, 40},
      .properties = {{141, 0}, {142, 40}},
      .taken = {{"mode", {0, 1}}, {"logN", {1, 100}}},
      .replaced = {{"mode", 1, {kMin, -1, 2, kMax}}, {"logN", 1, {kMin, -3, 0}}, {"logN", 100, {101, kMax}}},
      .mergings = {{{1, 5}, {0, 7}, {0, 5}},
                   {{0, 9}, {1, 7}, {0, 7}},
                   {{1, 1}, {1, 1}, {1, 1}},
                   {{0, 3}, {0, 2}, {0, 2}}},
      .describedIds = {141, 142},
      .describedKeys = {0, 1},
  };
}

Kind handDrawnGesture() {
  using Class = OptionGestureHMM;
  return {
      .sensor = "GSPX",
      .make = make<Class>,
      .settings = settings<Class, &Class::classMask>,
      .keys =
          {{"classMask", 65535, {1, 65535}, kReplaced, 65535, "gesture hmm: invalid clsmask value %", Merge::bitOr}},
      .common = {257},
      .properties = {},
      .taken = {{"classMask", {1, 65535}}},
      .replaced = {{"classMask", 65535, {kMin, -1, 0, 65536, kMax}}},
      .mergings = {{{1}, {32768}, {32769}}, {{6}, {3}, {7}}},
      .describedIds = {},
      .describedKeys = {},
      .unparsable = "gesture hmm: invalid opton string %, all set as default",
  };
}

Kind templateGesture() {
  using Class = OptionDTWGS;
  return {
      .sensor = "DTWGS",
      .make = make<Class>,
      .settings = settings<Class, &Class::mode, &Class::classMask, &Class::level, &Class::index>,
      .keys = {{"mode", 0, {1, 4}, kKept, 0, "Invalid mode value %", Merge::bitOr},
               {"classMask", 0, {1, 3}, kKept, 0, "Invalid mask value % at match mode", Merge::bitOr},
               {"level", 0, {-1, 1}, kKept, 0, "Invalid level value % at match mode", Merge::minimum},
               {"index", 0, {0, 1}, kKept, 0, "Invalid index value % at enroll mode", Merge::keepFirst}},
      .stringKeys = {"template1", "template2"},
      .common = {4, 3, 1, 1},
      .properties = {{121, 1}},
      .taken = {{"mode", {1, 4}},
                {"classMask", {1, 2, 3}},
                {"level", {-1, 0, 1}},
                {"index", {kMin, -1, 0, 7, kMax}}},  // the common mode, matching, does not look at it
      .refused = {{"mode", {kMin, -1, 0, 2, 3, 5, kMax}},
                  {"classMask", {kMin, -1, 0, 4, kMax}},
                  {"level", {kMin, -2, 2, kMax}}},
      .mergings = {{{4, 1, 1, 0}, {4, 2, -1, 1}, {4, 3, -1, 0}}, {{1, 1, 0, 1}, {4, 2, 1, 0}, {5, 3, 0, 1}}},
      .describedIds = {121, 122, 123},
      .describedKeys = {-1, -1, -1},
      .loggedOfEmptyObject = {"Invalid mode value 0"},
      .takesEmptyObject = false,
      .cloned = {4, 3, 1, 0},
  };
}

Kind earTouch() {
  using Class = OptionGestureEartouch;
  return {
      .sensor = "GSETH",
      .make = make<Class>,
      .settings = settings<Class, &Class::classMask>,
      .keys = {{"classMask", 3, {1, 3}, kReplaced, 3, "gesture eartouch: invalid clsmask value %", Merge::bitOr}},
      .common = {2},
      .properties = {{161, 2}},
      .taken = {{"classMask", {1, 2, 3}}},
      .replaced = {{"classMask", 3, {kMin, -1, 0, 4, kMax}}},
      .mergings = {{{1}, {2}, {3}}, {{2}, {2}, {2}}},
      .describedIds = {161},
      .describedKeys = {0},
      .unparsable = "gesture eartouch: invalid opton string %, all set as default",
  };
}

Kind audioClassification() {
  using Class = OptionAudioClassification;
  return {
      .sensor = "LPE_P",
      .make = make<Class>,
      .settings = settings<Class, &Class::interval>,
      .keys = {{"interval", 5000, kAny, kReplaced, 5000, "", Merge::takeLast}},
      .common = {1200},
      .properties = {{0, 1200}},
      .taken = {{"interval", {kMin, -1, 0, 1, kMax}}},
      .mergings = {{{100}, {7}, {7}}, {{7}, {100}, {100}}},
      .describedIds = {0},
      .describedKeys = {0},
      .unparsable = "audio : invalid opton string %, all set as default",
  };
}

Kind deadReckoning() {
  using Class = OptionPDR;
  return {
      .sensor = "PDR",
      .make = make<Class>,
      .settings = settings<Class, &Class::userHeight, &Class::floorHeight, &Class::initX, &Class::initY,
                           &Class::initFloor, &Class::N, &Class::sixDOF>,
      .keys =
          {{"userHeight", 1000, {100, 300}, kReplaced, 1000, "PDR: invalid user height value %", Merge::keepFirst},
           {"floorHeight", 5000, {200, 800}, kReplaced, 5000, "PDR: invalid floor height value %", Merge::keepFirst},
           {"initX", 32767, kAny, kReplaced, 32767, "", Merge::keepFirst},
           {"initY", 32767, kAny, kReplaced, 32767, "", Merge::keepFirst},
           {"initFloor", 32767, kAny, kReplaced, 32767, "", Merge::keepFirst},
           {"N", 0, {0, 6}, kReplaced, 0, "PDR: invalid N value %", Merge::minimum},
           {"6DOF", 2, {0, 1}, kReplaced, 2, "PDR: invalid 6DOF value %", Merge::keepFirst}},
      .common = {170, 300, 10, 20, 3, 2, 1},
      .properties = {{181, 170}, {182, 300}, {183, 10}, {184, 20}, {185, 3}, {186, 2}, {187, 1}},
      .taken = {{"userHeight", {100, 300}},
                {"floorHeight", {200, 800}},
                {"initX", {kMin, -1, 0, 32767, kMax}},
                {"initY", {kMin, -1, 0, 32767, kMax}},
                {"initFloor", {kMin, -1, 0, 32767, kMax}},
                {"N", {0, 6}},
                {"6DOF", {0, 1}}},
      .replaced = {{"userHeight", 1000, {kMin, -1, 0, 99, 301, 1000, kMax}},
                   {"floorHeight", 5000, {kMin, -1, 0, 199, 801, 5000, kMax}},
                   {"N", 0, {kMin, -1, 7, kMax}},
                   {"6DOF", 2, {kMin, -1, 2, kMax}}},
      .mergings = {{{170, 300, 1, 2, 3, 3, 0}, {180, 400, 4, 5, 6, 5, 1}, {170, 300, 1, 2, 3, 3, 0}},
                   {{180, 400, 4, 5, 6, 5, 1}, {170, 300, 1, 2, 3, 3, 0}, {180, 400, 4, 5, 6, 3, 1}}},
      .describedIds = {181, 182, 183, 184, 185, 186, 187},
      .describedKeys = {0, 1, 2, 3, 4, 5, 6},
      .loggedOfEmptyObject = {"PDR: invalid user height value 1000", "PDR: invalid floor height value 5000",
                              "PDR: invalid 6DOF value 2"},
  };
}

Kind lift() {
  using Class = OptionLift;
  return {
      .sensor = "LIFT",
      .make = make<Class>,
      .settings = settings<Class, &Class::classMask>,
      .keys = {{"classMask", 3, kNone, kReplaced, 3, "tapping: invalid clsmask value %", Merge::bitOr}},
      .common = {3},
      .properties = {{201, 3}},
      .taken = {},
      .replaced = {{"classMask", 3, {kMin, -1, 0, 1, 2, 3, 4, kMax}}},
      .mergings = {{{1}, {2}, {3}}},
      .describedIds = {201},
      .describedKeys = {0},
      .loggedOfEmptyObject = {"tapping: invalid clsmask value 3"},
      .loggedOfCommon = {"tapping: invalid clsmask value 3"},
  };
}

}  // namespace

std::vector<Kind> expectedKinds() {
  return {physicalActivity(), tapping(),
          flickGesture(),     shaking(),
          instantActivity(),  stepCount(),
          handDrawnGesture(), templateGesture(),
          earTouch(),         audioClassification(),
          deadReckoning(),    lift()};
}

}  // namespace senseloom
