#include "explain/option_reading.h"

#include <algorithm>
#include <array>
#include <cstdio>
#include <cstring>
#include <string_view>
#include <utility>

#include "explain/nearest_name.h"
#include "trace/json.h"

namespace senseloom::tool {
namespace {

constexpr size_t kMostTemplateBytes = 900;
constexpr size_t kLengthDigits = 4;

std::string quoted(std::string_view text) {
  return '"' + std::string(text) + '"';
}

// The line that the library logs about a value.
std::string logged(const char* message, int32_t value) {
  if (message == nullptr) return "";
  std::array<char, 128> line;
  std::snprintf(line.data(), line.size(), message, value);
  return line.data();
}

std::string outOfRange(const OptionKey& key, int32_t value) {
  const std::string subject = quoted(key.name) + ' ' + std::to_string(value);
  return key.range.low > key.range.high ? subject + " is not taken, as no value is"
                                        : subject + " is not in " + rangeText(key.range);
}

// Reads one string. The steps are those of the library, in its order.
class Reader {
 public:
  Reader(const OptionDescription& description, TemplateLengths& lengths) : kind(description), templates(lengths) {}

  OptionReading read(const std::optional<std::string>& text) {
    if (!text) {
      remark("a null pointer is refused");
      return std::move(reading);
    }
    json_error_t error;
    const Json root(json_loads(text->c_str(), 0, &error));
    if (root == nullptr) {
      refuseText(*text, error.text);
      return std::move(reading);
    }
    if (!json_is_object(root.get())) remark("not an object, so that every key has its default");
    warnOfUnknownKeys(root.get());
    if (!storeTemplates(root.get())) return std::move(reading);

    Wishes wishes(kind);
    for (const OptionKey& key : kind.keys) wishes[key.name] = wish(key, json_object_get(root.get(), key.name));
    if (std::string_view(kind.sensor) == "DTWGS") {
      reading.accepted = isTemplateGesture(wishes);
    } else {
      for (const OptionKey& key : kind.keys) checkRange(key, wishes[key.name]);
      adjust(wishes);
      reading.accepted = true;
    }
    if (reading.accepted) reading.wishes = std::move(wishes);
    return std::move(reading);
  }

 private:
  void remark(std::string text, std::string line = {}) {
    reading.remarks.push_back({std::move(text), std::move(line)});
  }

  void refuseText(const std::string& text, const char* error) {
    reading.notJson = error;
    // The step counter's session overrules its option here.
    reading.accepted = kind.unparsableResult == 0 || std::string_view(kind.sensor) == "SCOUN";
    std::string line;
    if (kind.unparsableMessage != nullptr) {
      line = kind.unparsableMessage;
      line.replace(line.find("%s"), 2, text);
    }
    remark(std::string("no JSON (") + error +
               "): " + (reading.accepted ? "accepted all the same, and the session keeps its option" : "refused"),
           line);
  }

  void warnOfUnknownKeys(json_t* root) {
    std::vector<std::string_view> names(kind.stringKeys.begin(), kind.stringKeys.end());
    for (const OptionKey& key : kind.keys) names.emplace_back(key.name);
    const char* name;
    json_t* value;
    json_object_foreach(root, name, value) {
      if (std::find(names.begin(), names.end(), name) != names.end()) continue;
      remark("unknown key " + quoted(name) + " has no effect: the nearest known key is " +
             quoted(nearestName(name, names)));
    }
  }

  Wish wish(const OptionKey& key, const json_t* value) {
    if (json_is_integer(value)) {
      const auto number = static_cast<int32_t>(json_integer_value(value));
      if (number != json_integer_value(value)) {
        remark(quoted(key.name) + ' ' + std::to_string(json_integer_value(value)) + " is cut to 32 bits, " +
               std::to_string(number));
      }
      return {.value = number, .asked = number};
    }
    if (value != nullptr) remark(quoted(key.name) + " is no integer and counts as not given");
    return {.value = key.defaultValue, .asked = key.defaultValue, .isDefault = true};
  }

  void checkRange(const OptionKey& key, Wish& wish) {
    if (key.range.contains(wish.value)) return;
    if (key.outOfRange == OutOfRange::clamped) wish.value = std::clamp(wish.value, key.range.low, key.range.high);
    if (key.outOfRange == OutOfRange::replaced) wish.value = key.fallback;
    const std::string line = logged(key.message, wish.asked);
    if (wish.isDefault) {
      if (!line.empty())
        remark(quoted(key.name) + " is not given: its default is kept, and logged as a bad value", line);
      return;
    }
    const char* outcome = key.outOfRange == OutOfRange::kept ? " is kept" : " is used";
    remark(outOfRange(key, wish.asked) + ": " + std::to_string(wish.value) + outcome, line);
  }

  // What the code of single kinds adds.
  void adjust(Wishes& wishes) {
    const std::string_view sensor = kind.sensor;
    if (sensor == "PHYAC" && wishes.valueOf("logM") > wishes.valueOf("logN")) {
      wishes["logM"].value = wishes.valueOf("logN");
      remark("\"logM\" is cut to \"logN\", " + std::to_string(wishes.valueOf("logN")));
    }
    if (sensor == "STAP" && wishes.valueOf("level") != std::clamp(wishes.valueOf("level"), -5, 5)) {
      wishes["classMask"].value = 0;
      remark("the bad \"level\" sets \"classMask\" to 0: no tap is delivered");
    }
  }

  // Template gestures alone have strings. What is stored is not undone when the option is refused later.
  bool storeTemplates(const json_t* root) {
    bool allStored = true;
    for (size_t slot = 0; slot < kind.stringKeys.size(); ++slot) {
      const json_t* value = json_object_get(root, kind.stringKeys[slot]);
      if (!json_is_string(value)) {
        if (value != nullptr) remark(quoted(kind.stringKeys[slot]) + " is no string and counts as not given");
        continue;
      }
      if (const auto length = templateLength(json_string_value(value))) {
        templates.at(slot) = *length;
        continue;
      }
      allStored = false;
      remark(quoted(kind.stringKeys[slot]) + " is no template of at most 900 bytes: the whole option is refused",
             "Invalid template" + std::to_string(slot + 1) + " value");
    }
    return allStored;
  }

  // The length that a template's text declares, if the text can be stored.
  static std::optional<size_t> templateLength(const char* text) {
    const size_t digits = std::strlen(text);
    if (digits < kLengthDigits || (digits - kLengthDigits) / 2 > kMostTemplateBytes) return std::nullopt;
    int length = 0;
    for (size_t i = 0; i < kLengthDigits; ++i) {
      const char digit = text[i];
      length = length * 16 + (digit >= 'a' && digit <= 'z' ? digit - 'a' + 10 : digit - '0');
    }
    if (length < 0 || length > static_cast<int>(kMostTemplateBytes)) return std::nullopt;
    return static_cast<size_t>(length);
  }

  // Template gestures refuse the whole option for the first bad value.
  bool isTemplateGesture(const Wishes& wishes) {
    const int32_t mode = wishes.valueOf("mode");
    if (mode != 1 && mode != 4) {
      remark("\"mode\" must be 1 (enroll) or 4 (match): the whole option is refused",
             logged(kind.keys[0].message, mode));
      return false;
    }
    for (const char* name : mode == 4 ? std::vector{"classMask", "level"} : std::vector{"index"}) {
      const auto key = std::find_if(kind.keys.begin(), kind.keys.end(),
                                    [name](const OptionKey& known) { return std::string_view(known.name) == name; });
      const int32_t value = wishes.valueOf(name);
      if (key->range.contains(value)) continue;
      remark(outOfRange(*key, value) + ": the whole option is refused", logged(key->message, value));
      return false;
    }
    return true;
  }

  const OptionDescription& kind;
  TemplateLengths& templates;
  OptionReading reading;
};

}  // namespace

OptionReading readOption(const OptionDescription& kind, const std::optional<std::string>& text,
                         TemplateLengths& templates) {
  return Reader(kind, templates).read(text);
}

}  // namespace senseloom::tool
