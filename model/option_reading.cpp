#include "option_reading.h"

#include <jansson.h>

#include <algorithm>
#include <memory>
#include <string>
#include <string_view>
#include <utility>

#include "duplicate_keys.h"
#include "nearest_name.h"

namespace senseloom::model {
namespace {

struct Release {
  void operator()(json_t* json) const { json_decref(json); }
};
using Json = std::unique_ptr<json_t, Release>;

// Reads one string, in the steps of the library and in its order.
class Reader {
 public:
  Reader(Request& target, const ReadingPlace& where) : request(target), row(rowOf(target.kind())), place(where) {}

  bool read(const char* text, bool hasMemory) {
    json_error_t error{};
    const Json root(hasMemory ? json_loads(text, 0, &error) : nullptr);
    if (root == nullptr) return readNotJson(text, error.text);
    if (place.remarks != nullptr) remarkOnKeys(root.get(), text);
    if (!storeTemplates(root.get())) return false;

    Request given(request.kind());
    for (const Key& key : row.keys) given[key.name] = requested(key, json_object_get(root.get(), key.name));
    if (request.kind() == dtwgs) {
      if (!areTemplateSettings(given)) return false;
    } else {
      for (const Key& key : row.keys) checkRange(key, given[key.name]);
      adjust(given);
    }
    request = given;
    return true;
  }

 private:
  // Makes and keeps a remark, if any is wanted.
  template <class Make, class... Arguments>
  void remark(Make make, const Arguments&... arguments) {
    if (place.remarks != nullptr) place.remarks->push_back(make(arguments...));
  }

  std::string logged(const char* format, int32_t value) {
    return format == nullptr ? "" : write(place.log, kError, row.tag, format, value);
  }

  bool readNotJson(const char* text, const char* error) {
    const std::string line = row.notJson == nullptr ? "" : write(place.log, kError, row.tag, row.notJson, text);
    remark(notJson, error, row.acceptsNotJson, line);
    return row.acceptsNotJson;
  }

  void remarkOnKeys(json_t* root, const char* text) {
    if (!json_is_object(root)) remark(notAnObject);
    for (const std::string& key : keysGivenTwice(text)) remark(givenTwice, key);
    std::vector<std::string_view> known;
    for (const StringKey& key : row.stringKeys) known.emplace_back(key.name);
    for (const Key& key : row.keys) known.emplace_back(key.name);
    const char* name;
    json_t* value;
    json_object_foreach(root, name, value) {
      if (std::find(known.begin(), known.end(), name) == known.end())
        remark(unknownKey, name, nearestName(name, known));
    }
  }

  // Templates are stored before anything is checked, and so even of a string that is refused.
  bool storeTemplates(const json_t* root) {
    bool stored = true;
    for (size_t slot = 0; slot < row.stringKeys.size(); ++slot) {
      const char* key = row.stringKeys.begin()[slot].name;
      const json_t* value = json_object_get(root, key);
      if (!json_is_string(value)) {
        if (value != nullptr) remark(notAString, key);
      } else if (!place.templates.store(slot, json_string_value(value))) {
        stored = false;
        remark(refusedTemplate, key, logged("Invalid template%d value", static_cast<int32_t>(slot + 1)));
      }
    }
    return stored;
  }

  Requested requested(const Key& key, const json_t* value) {
    if (json_is_integer(value)) {
      const int64_t whole = json_integer_value(value);
      const auto number = static_cast<int32_t>(whole);
      if (number != whole) remark(cutTo32Bits, key.name, whole, number);
      if (!key.hasEffect) remark(withoutEffect, key);
      return {number, number, false};
    }
    if (value != nullptr) remark(notAnInteger, key.name);
    return {key.defaultValue, key.defaultValue, true};
  }

  void checkRange(const Key& key, Requested& requested) {
    if (key.takes(requested.value)) return;
    const std::string line = logged(key.message, requested.value);
    if (key.outOfRange == OutOfRange::clamped) requested.value = std::clamp(requested.value, key.low, key.high);
    if (key.outOfRange == OutOfRange::replaced) requested.value = key.fallback;
    if (!requested.isDefault) {
      remark(outOfRange, key, requested, line);
    } else if (!line.empty()) {
      remark(defaultLogged, key, line);
    }
  }

  // What is particular to single kinds.
  void adjust(Request& given) {
    if (given.kind() == phyac && given.value("logM") > given.value("logN")) {
      given["logM"].value = given.value("logN");
      remark(logMCut, given.value("logN"));
    }
    if (given.kind() == stap && !keyOf(stap, keyIndex(stap, "level")).takes(given.value("level"))) {
      given["classMask"].value = 0;
      remark(maskEmptied);
    }
  }

  // One bad value refuses the whole string.
  bool areTemplateSettings(const Request& given) {
    const int32_t mode = given.value("mode");
    if (mode != 1 && mode != 4) {
      remark(refusedMode, logged(keyOf(dtwgs, keyIndex(dtwgs, "mode")).message, mode));
      return false;
    }
    for (const std::string_view name : mode == 4 ? std::vector{"classMask", "level"} : std::vector{"index"}) {
      const Key& key = keyOf(dtwgs, keyIndex(dtwgs, name));
      const int32_t value = given.value(name);
      if (key.takes(value)) continue;
      remark(refusedValue, key, value, logged(key.message, value));
      return false;
    }
    return true;
  }

  Request& request;
  const KindRow& row;
  const ReadingPlace& place;
};

}  // namespace

bool readOption(Request& request, const char* text, bool hasMemory, const ReadingPlace& place) {
  return Reader(request, place).read(text, hasMemory);
}

}  // namespace senseloom::model
