#pragma once

#include <jansson.h>

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <span>

#include "option/option.h"
#include "option/option_description.h"

namespace senseloom {

// The value of an integer key, cut to 32 bits; `fallback` when the key is missing or of any other type.
int32_t readInteger(const json_t* root, const char* key, int32_t fallback);

// Reads an option string: the values of a kind's keys as they were given, and the settings that they lead to. Returns
// false, with both unchanged, when the text cannot be read; what is to be logged of that was logged.
bool readKeys(const OptionDescription& kind, const char* text, std::span<int32_t> given, std::span<int32_t> settings);

// A property list whose entries point at `values`, one for each property of the kind; null when memory ran out.
ctx_option_t* makeList(const OptionDescription& kind, std::span<int32_t> values);

// For each property of a kind the key whose setting it shows; the number of keys where it shows none.
template <const OptionDescription& kDescription>
constexpr auto shownKeys() {  // not covered: runs while compiling
  std::array<size_t, kDescription.properties.size()> keys{};
  for (size_t i = 0; i < keys.size(); ++i) keys[i] = kDescription.findKey(kDescription.properties[i].name);
  return keys;
}

// An option whose keys are all integers: it does what its kind's description says. `Kind` is the class that derives
// from this one; it adds its own code where it is peculiar.
template <class Kind, const OptionDescription& kDescription>
class IntegerOption : public Option {
 public:
  static constexpr const OptionDescription& kind = kDescription;

  IntegerOption() {
    for (size_t i = 0; i < settings.size(); ++i) settings[i] = kDescription.keys[i].defaultValue;
  }

  int parse(const char* text) final {
    Settings given{};
    if (!readKeys(kDescription, text, given, settings)) return kDescription.unparsableResult;
    mirrors = {};
    adjust(given);
    return 0;
  }

  // The rules are known to the compiler here: a negotiation merges once for each session of the sensor.
  void merge(const Option& other) override {
    const Settings& theirs = static_cast<const IntegerOption&>(other).settings;
    for (size_t i = 0; i < settings.size(); ++i) {
      settings[i] = merged(kDescription.keys[i].merge, settings[i], theirs[i]);
    }
  }

  std::unique_ptr<Option> clone() const final { return std::make_unique<Kind>(static_cast<const Kind&>(*this)); }

  void setProperty(ctx_option_t** out) final {
    if (out == nullptr) return;
    for (size_t i = 0; i < mirrors.size(); ++i) mirrors[i] = valueOf(i);
    *out = makeList(kDescription, mirrors);
  }

 protected:
  using Settings = std::array<int32_t, kDescription.keys.size()>;

  // The setting of a key, as in setting<kind.key("level")>().
  template <size_t kKey>
  int32_t setting() const {
    return settings[kKey];
  }
  template <size_t kKey>
  void set(int32_t value) {
    settings[kKey] = value;
  }

 private:
  using Mirrors = std::array<int32_t, kDescription.properties.size()>;
  static constexpr auto kShownKeys = shownKeys<kDescription>();
  static constexpr bool kComputes =
      std::any_of(kShownKeys.begin(), kShownKeys.end(), [](size_t key) { return key == kDescription.keys.size(); });

  // Called at the end of a parse that took the string, with the values as they were given.
  virtual void adjust(const Settings& /*given*/) {}

  // What a property shows. Where it is no key's setting, the kind has a compute(property).
  int32_t valueOf(size_t property) const {
    if constexpr (kComputes) {
      if (kShownKeys[property] == settings.size()) {
        return static_cast<const Kind&>(*this).compute(kDescription.properties[property]);
      }
    }
    return settings[kShownKeys[property]];
  }

  Settings settings;
  Mirrors mirrors{};  // what the entries of the last property list point at
};

}  // namespace senseloom
