#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <initializer_list>
#include <iterator>
#include <limits>
#include <string_view>

// What is data about the sensors: a table of the model's own, which shares nothing with the library.
namespace senseloom::model {

// What becomes of a value out of its key's range.
enum class OutOfRange {
  replaced,  // by the key's fallback
  clamped,   // to the nearer bound
  kept,      // the kind's own code deals with it
};

// How the values of several sessions become one.
enum class Rule {
  bitOr,
  minimum,
  maximum,
  allOne,     // 1 when all are 1, else 0
  anySet,     // 1 when any is not 0, else 0
  keepFirst,  // that of the session which the merge starts from
  takeLast,   // that of the session opened last
};

// What decides whether a session delivers a record.
enum class Judging {
  nothing,        // it delivers all
  classSet,       // the mask has one of the 16-bit set's bits
  classNumber16,  // the mask has the bit of the class with that number, from 1
  classNumber32,
  stepMultiples,  // the number of steps is a multiple, where that is asked for
  activity,       // batches, votes, masks and changes
  gestures,       // what the gesture engine recognises in it
  gathering,      // there are enough items
};

// An integer key of an option string.
struct Key {
  const char* name;
  int32_t defaultValue = 0;
  int32_t low = std::numeric_limits<int32_t>::min();  // of its range; above `high`: no value is in range
  int32_t high = std::numeric_limits<int32_t>::max();
  OutOfRange outOfRange = OutOfRange::replaced;
  int32_t fallback = defaultValue;
  const char* message = nullptr;  // format of the line logged about a value out of range; null: none
  Rule merge = Rule::keepFirst;
  const char* means = nullptr;  // what it asks for, for people
  bool hasEffect = true;        // on a property or on what a session delivers

  constexpr bool takes(int32_t value) const { return low <= value && value <= high; }
};

// A key with a string for its value.
struct StringKey {
  const char* name;
  const char* means;
};

// An entry of a property list.
struct PropertyRow {
  int32_t id;
  const char* name;
  const char* key = nullptr;    // whose value it shows; null: the value is computed
  const char* means = nullptr;  // of a computed value, for people
  bool hasHalves = false;       // of 16 bits each, which are two numbers
};

struct KindRow {
  const char* sensor;
  std::initializer_list<Key> keys;
  std::initializer_list<StringKey> stringKeys = {};
  std::initializer_list<PropertyRow> properties = {};
  Judging judging = Judging::nothing;
  const char* tag = "libsenseloom";
  const char* notJson = nullptr;  // format of the line logged about text that is not JSON; null: none
  bool acceptsNotJson = false;    // such a text changes nothing, but the sensor negotiates
};

// In the library's order. A kind is its place here.
inline constexpr KindRow kKindTable[] = {
    {.sensor = "PHYAC",
     .keys = {{.name = "mode",
               .merge = Rule::allOne,
               .means = "1: a result only when its class has changed; any other: every result"},
              {.name = "logN",
               .low = 0,
               .high = 8,
               .outOfRange = OutOfRange::clamped,
               .merge = Rule::minimum,
               .means = "N = 2^logN decisions are weighed for a result"},
              {.name = "logM",
               .low = 0,
               .high = 8,
               .outOfRange = OutOfRange::clamped,
               .merge = Rule::minimum,
               .means = "the sensor decides anew each 2^logM; a client's batch is 2^(logN - merged logM)"},
              {.name = "classMask",
               .defaultValue = -1,
               .low = -1,
               .high = 255,
               .merge = Rule::bitOr,
               .means = "the classes wanted, bit i for class i; -1: all; other classes come out as class 0"},
              {.name = "summary",
               .defaultValue = 1,
               .low = 0,
               .high = 1,
               .means = "1: a result is one decision, the class with the majority or 6; 0: it is the whole batch"},
              {.name = "weightVar",
               .defaultValue = -1,
               .low = 0,
               .means = "in a vote each decision weighs (1 + 2^-weightVar) times the one before; -1: all the same"},
              {.name = "continuous",
               .low = 0,
               .high = 1,
               .fallback = 1,
               .merge = Rule::anySet,
               .means = "no effect: it is read and merged, but in no property and used by no session",
               .hasEffect = false}},
     .properties = {{41, "mode", "mode"},
                    {43, "spans", nullptr,
                     "2^logN: in the high 16 bits for the largest logN as given, in the low 16 for the smallest", true},
                    {44, "decisionsPerSpan", nullptr,
                     "2^(logN - logM), of the merged values: what the sensor decides in the shortest span"},
                    {42, "classMask", "classMask"}},
     .judging = Judging::activity},
    {.sensor = "STAP",
     .keys = {{.name = "classMask",
               .defaultValue = 3,
               .low = 1,
               .high = 3,
               .message = "tapping: invalid clsmask value %d",
               .merge = Rule::bitOr,
               .means =
                   "the taps wanted, as a set of bits; what a bit stands for is defined by whoever makes the records"},
              {.name = "level",
               .low = -5,
               .high = 5,
               .outOfRange = OutOfRange::kept,
               .message = "tapping: invalid level value %d",
               .merge = Rule::minimum,
               .means = "the sensitivity of the sensor; its steps are defined by whoever makes the records"}},
     .properties = {{101, "classMask", "classMask"}, {102, "level", "level"}},
     .judging = Judging::classSet},
    {.sensor = "GSFLK",
     .keys = {{.name = "classMask",
               .defaultValue = 63,
               .low = 1,
               .high = 63,
               .message = "gestureflick: invalid clsmask value %d",
               .merge = Rule::bitOr,
               .means = "the classes wanted, bit i for class i + 1; a class is defined by whoever makes the records"},
              {.name = "level",
               .low = -5,
               .high = 5,
               .message = "gestureflick: invalid level value %d",
               .merge = Rule::minimum,
               .means = "the sensitivity of the sensor; its steps are defined by whoever makes the records"}},
     .properties = {{61, "classMask", "classMask"}, {62, "level", "level"}},
     .judging = Judging::classNumber16,
     .notJson = "gestureflick: invalid opton string %s, all set as default"},
    {.sensor = "SHAKI",
     .keys = {{.name = "sensitivity",
               .defaultValue = 1,
               .low = 0,
               .high = 2,
               .message = "shaking: invalid clsmask value %d",
               .merge = Rule::maximum,
               .means = "the sensitivity of the sensor; its steps are defined by whoever makes the records"}},
     .properties = {{81, "sensitivity", "sensitivity"}},
     .notJson = "shaking: invalid opton string %s, all set as default"},
    {.sensor = "ISACT",
     .keys = {{.name = "classMask",
               .defaultValue = 15,
               .low = 1,
               .high = 15,
               .message = "instantactivity: invalid clsmask value %d",
               .merge = Rule::bitOr,
               .means = "the classes wanted, bit i for class i + 1; a class is defined by whoever makes the records"}},
     .properties = {{151, "classMask", "classMask"}},
     .judging = Judging::classNumber32,
     .tag = "STY",
     .notJson = "instantactivity: invalid opton string %s, all set as default",
     .acceptsNotJson = true},
    {.sensor = "SCOUN",
     .keys = {{.name = "mode",
               .defaultValue = 1,
               .low = 0,
               .high = 1,
               .merge = Rule::allOne,
               .means = "1: every count is delivered; 0: only multiples of logN * 100 steps"},
              {.name = "logN",
               .defaultValue = 1,
               .low = 1,
               .high = 100,
               .outOfRange = OutOfRange::clamped,
               .merge = Rule::minimum,
               .means = "hundreds of steps from one result to the next; a plain count, not a logarithm"}},
     .properties = {{141, "mode", "mode"}, {142, "logN", "logN"}},
     .judging = Judging::stepMultiples,
     .acceptsNotJson = true},
    {.sensor = "GSPX",
     .keys = {{.name = "classMask",
               .defaultValue = 65535,
               .low = 1,
               .high = 65535,
               .message = "gesture hmm: invalid clsmask value %d",
               .merge = Rule::bitOr,
               .means =
                   "the classes wanted, bit i for class i + 1: 1 to 9 are these digits, 10 is 0, 11 to 16 are A to F"}},
     .judging = Judging::gestures,
     .notJson = "gesture hmm: invalid opton string %s, all set as default"},
    {.sensor = "DTWGS",
     .keys = {{.name = "mode",
               .low = 1,
               .high = 4,
               .outOfRange = OutOfRange::kept,
               .message = "Invalid mode value %d",
               .merge = Rule::bitOr,
               .means = "1: enroll a gesture; 4: recognise movements by the templates"},
              {.name = "classMask",
               .low = 1,
               .high = 3,
               .outOfRange = OutOfRange::kept,
               .message = "Invalid mask value %d at match mode",
               .merge = Rule::bitOr,
               .means = "the templates wanted: bit 0 the first, bit 1 the second"},
              {.name = "level",
               .low = -1,
               .high = 1,
               .outOfRange = OutOfRange::kept,
               .message = "Invalid level value %d at match mode",
               .merge = Rule::minimum,
               .means = "how exact a match has to be; its steps are defined by whoever makes the records"},
              {.name = "index",
               .low = 0,
               .high = 1,
               .outOfRange = OutOfRange::kept,
               .message = "Invalid index value %d at enroll mode",
               .means = "the template to enroll, 0 or 1; the library checks it and uses it for nothing else"}},
     .stringKeys =
         {{"template1",
           "a template: four digits of length in bytes, then two digits a byte, lower case; kept for all sessions"},
          {"template2", "the second one, likewise"}},
     .properties = {{121, "level", nullptr, "\"level\", merged"},
                    {122, "templateNumber", nullptr, "0 or 1: the template that the next entry holds"},
                    {123, "templateData", nullptr, "the bytes of that template, as many as its text declared"}},
     .judging = Judging::classSet},
    {.sensor = "GSETH",
     .keys = {{.name = "classMask",
               .defaultValue = 3,
               .low = 1,
               .high = 3,
               .message = "gesture eartouch: invalid clsmask value %d",
               .merge = Rule::bitOr,
               .means = "the classes wanted, bit i for class i + 1; a class is defined by whoever makes the records"}},
     .properties = {{161, "classMask", "classMask"}},
     .judging = Judging::classNumber16,
     .notJson = "gesture eartouch: invalid opton string %s, all set as default"},
    {.sensor = "LPE_P",
     .keys =
         {{.name = "interval",
           .defaultValue = 5000,
           .merge = Rule::takeLast,
           .means = "the time from one classification to the next; its unit is defined by whoever makes the records"}},
     .properties = {{0, "interval", "interval"}},
     .notJson = "audio : invalid opton string %s, all set as default"},
    {.sensor = "PDR",
     .keys = {{.name = "userHeight",
               .defaultValue = 1000,
               .low = 100,
               .high = 300,
               .message = "PDR: invalid user height value %d",
               .means = "the walker's height; its unit is defined by whoever makes the records"},
              {.name = "floorHeight",
               .defaultValue = 5000,
               .low = 200,
               .high = 800,
               .message = "PDR: invalid floor height value %d",
               .means = "the height of a floor; its unit is defined by whoever makes the records"},
              {.name = "initX",
               .defaultValue = 32767,
               .means = "where the walk starts; its unit is defined by whoever makes the records; 32767: not given"},
              {.name = "initY",
               .defaultValue = 32767,
               .means = "where the walk starts; its unit is defined by whoever makes the records; 32767: not given"},
              {.name = "initFloor",
               .defaultValue = 32767,
               .means = "the floor on which the walk starts; 32767: not given"},
              {.name = "N",
               .low = 0,
               .high = 6,
               .message = "PDR: invalid N value %d",
               .merge = Rule::minimum,
               .means = "items are delivered once 2^N or more are gathered"},
              {.name = "6DOF",
               .defaultValue = 2,
               .low = 0,
               .high = 1,
               .message = "PDR: invalid 6DOF value %d",
               .means = "1: the sensor uses all six degrees of freedom; 0: it does not; 2: not given"}},
     .properties = {{181, "userHeight", "userHeight"},
                    {182, "floorHeight", "floorHeight"},
                    {183, "initX", "initX"},
                    {184, "initY", "initY"},
                    {185, "initFloor", "initFloor"},
                    {186, "N", "N"},
                    {187, "6DOF", "6DOF"}},
     .judging = Judging::gathering},
    // It takes no mask at all: each option string is logged as holding a bad one, and the mask stays 3.
    {.sensor = "LIFT",
     .keys = {{.name = "classMask",
               .defaultValue = 3,
               .low = 1,
               .high = 0,
               .message = "tapping: invalid clsmask value %d",
               .merge = Rule::bitOr,
               .means = "no effect: the mask is always 3, and every record is delivered"}},
     .properties = {{201, "classMask", "classMask"}}},
};
inline constexpr int kKinds = static_cast<int>(std::size(kKindTable));
inline constexpr size_t kMostKeys = 7;

constexpr const KindRow& rowOf(int kind) {
  return kKindTable[static_cast<size_t>(kind)];
}
constexpr const Key& keyOf(int kind, size_t index) {
  return rowOf(kind).keys.begin()[index];
}

// The sensor with that name; -1 when there is none.
constexpr int kindNamed(std::string_view sensor) {
  for (int kind = 0; kind < kKinds; ++kind) {
    if (rowOf(kind).sensor == sensor) return kind;
  }
  return -1;
}

// The kinds that code tells apart.
enum Kind {
  phyac = kindNamed("PHYAC"),
  stap = kindNamed("STAP"),
  gsflk = kindNamed("GSFLK"),
  shaki = kindNamed("SHAKI"),
  isact = kindNamed("ISACT"),
  scoun = kindNamed("SCOUN"),
  gspx = kindNamed("GSPX"),
  dtwgs = kindNamed("DTWGS"),
  gseth = kindNamed("GSETH"),
  lpe = kindNamed("LPE_P"),
  pdr = kindNamed("PDR"),
  lift = kindNamed("LIFT"),
};

// The place of a key in its kind's row; the number of keys when there is no such key.
constexpr size_t keyIndex(int kind, std::string_view key) {
  size_t index = 0;
  while (index < rowOf(kind).keys.size() && keyOf(kind, index).name != key) ++index;
  return index;
}

static_assert(std::ranges::all_of(kKindTable, [](const KindRow& row) { return row.keys.size() <= kMostKeys; }));
static_assert(std::ranges::all_of(kKindTable,
                                  [](const KindRow& row) {
                                    return std::ranges::all_of(row.keys,
                                                               [](auto& key) { return key.means != nullptr; });
                                  }),
              "a key of kKindTable does not say what it means");

}  // namespace senseloom::model
