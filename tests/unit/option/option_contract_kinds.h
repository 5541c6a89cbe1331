#pragma once

#include <cstdint>
#include <memory>
#include <ostream>
#include <string>
#include <utility>
#include <vector>

#include "option/option.h"
#include "option/option_description.h"

// What the contract test expects of each option kind: a table of the tests' own, which shares nothing with the data
// that the library works by.
namespace senseloom {

// The settings of an option, or the values of a string, in the order of the kind's keys.
using Values = std::vector<int32_t>;

struct Key {
  std::string name;
  int32_t defaultValue;
  Range range;
  OutOfRange outOfRange;
  int32_t fallback;
  std::string message;  // with "%" for the value; empty: none
  Merge merge;
};

// Values of a key that all have the setting `stored`.
struct Replaced {
  std::string key;
  int32_t stored;
  Values values;
};

// A value of a key, and all settings that it leads to.
struct Particular {
  std::string key;
  int32_t value;
  Values settings;
};

// The settings of an option after another is merged in, of strings with these values.
struct Merging {
  Values mine;
  Values other;
  Values merged;
};

struct Kind {
  const char* sensor;
  std::unique_ptr<Option> (*make)();
  Values (*settings)(const Option&);
  std::vector<Key> keys;
  std::vector<std::string> stringKeys = {};

  // A string with these values sets these settings, which differ from the defaults where that is possible, and renders
  // these properties (id and value). The lists below tell what comes of other values for one of its keys.
  Values common;
  std::vector<std::pair<int32_t, int32_t>> properties;
  std::vector<std::pair<std::string, Values>> taken;  // set as they are, silently
  std::vector<Replaced> replaced = {};                // logged with the key's message, and replaced
  std::vector<Particular> particular = {};            // logged with the key's message, if it has one
  std::vector<std::pair<std::string, Values>> refused =
      {};  // logged with the key's message; the whole string is refused

  std::vector<Merging> mergings;

  std::vector<int32_t> describedIds;  // of the properties that the kind can have
  std::vector<int> describedKeys;     // whose setting each of these shows; -1: of no single one
  std::string tag = "libsenseloom";
  std::string unparsable = {};  // the message about text that is no JSON, with "%" for the text; empty: none
  int unparsableResult = -1;
  bool nullIsLogged = false;
  std::vector<std::string> loggedOfEmptyObject = {};
  bool takesEmptyObject = true;
  std::vector<std::string> loggedOfCommon = {};
  Values cloned = {};  // the settings of a clone of the common one, where they differ
};

// Names the kind in what GoogleTest prints.
inline void PrintTo(const Kind& kind, std::ostream* out) {
  *out << kind.sensor;
}

// The twelve kinds in the registry's order.
std::vector<Kind> expectedKinds();

}  // namespace senseloom
