#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <span>
#include <string_view>

// What is data about an option kind. Parsing, merging and rendering read it, the command-line tool prints it, and one
// contract test checks every kind against it.
namespace senseloom {

// The values that a key takes as they are, both bounds included.
struct Range {
  int32_t low = std::numeric_limits<int32_t>::min();
  int32_t high = std::numeric_limits<int32_t>::max();

  constexpr bool contains(int32_t value) const { return low <= value && value <= high; }
};
inline constexpr Range kAnyValue{};
inline constexpr Range kNoValue{.low = 1, .high = 0};

// What becomes of a value out of range, after it was logged.
enum class OutOfRange {
  replaced,  // by the key's fallback
  clamped,   // to the nearer bound
  kept,      // the kind's own code deals with it
};

// How the settings of several sessions become one. All but keepFirst and takeLast are commutative and associative, so
// neither the order of the sessions nor the one that the merge starts from, as a copy of its option, matters; and they
// are idempotent (allOne and anySet for 0 and 1), so it does not matter either that this one is merged in once more.
enum class Merge {
  bitOr,
  minimum,
  maximum,
  allOne,     // 1 when all are 1, else 0
  anySet,     // 1 when any is not 0, else 0
  keepFirst,  // the option that the merge starts from decides
  takeLast,   // the session that was opened last decides
};
constexpr int32_t merged(Merge rule, int32_t mine, int32_t other) {
  switch (rule) {  // not covered: that no case fits, since each rule has one
    case Merge::bitOr:
      return mine | other;
    case Merge::minimum:
      return std::min(mine, other);
    case Merge::maximum:
      return std::max(mine, other);
    case Merge::allOne:
      return mine == 1 && other == 1 ? 1 : 0;
    case Merge::anySet:
      return mine != 0 || other != 0 ? 1 : 0;
    case Merge::takeLast:
      return other;
    case Merge::keepFirst:
      break;
  }
  return mine;
}

// One integer key of an option string.
struct OptionKey {
  const char* name;
  int32_t defaultValue = 0;
  Range range = kAnyValue;
  OutOfRange outOfRange = OutOfRange::replaced;
  int32_t fallback = defaultValue;
  const char* message = nullptr;  // format of the log line about a value out of range, which is its one %d; null: none
  Merge merge = Merge::keepFirst;
  const char* note = nullptr;  // what the kind's own code adds to the above, for the tool to print
};

// One entry of a property list. It shows the setting of the key of its name; when there is none, the kind's own code
// makes its value.
struct OptionProperty {
  int32_t id;
  const char* name;
};

struct OptionDescription {
  const char* sensor;  // registry name
  const char* title;   // what it senses, for people
  std::span<const OptionKey> keys;
  std::span<const char* const> stringKeys = {};  // keys with string values, which the kind's own code reads
  std::span<const OptionProperty> properties;
  const char* logTag;
  const char* unparsableMessage =
      nullptr;                    // format of the log line about text that is not JSON, its one %s; null: none
  int unparsableResult = -1;      // of parsing such text, or a null text
  bool nullIsUnparsable = false;  // a null text is logged as text that is not JSON
  const char* note = nullptr;     // what is particular about the whole option, for the tool to print

  // The index of the key of that name; the number of keys when there is none.
  constexpr size_t findKey(std::string_view name) const {  // not covered: runs while compiling
    size_t i = 0;
    while (i < keys.size() && keys[i].name != name) ++i;
    return i;
  }
  // The same for a constant name; does not compile when there is no such key.
  constexpr size_t key(std::string_view name) const {  // not covered: runs while compiling
    const size_t found = findKey(name);
    return found < keys.size() ? found : throw "no such key";
  }
};

}  // namespace senseloom
