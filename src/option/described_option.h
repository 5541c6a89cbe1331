#pragma once

#include <jansson.h>

#include <array>
#include <cstddef>
#include <memory>

#include "option/option.h"
#include "option/option_description.h"

namespace senseloom {

struct JsonRelease {
  void operator()(json_t* json) const { json_decref(json); }
};
using JsonRoot = std::unique_ptr<json_t, JsonRelease>;

// The value of an integer key, cut to 32 bits; `fallback` when the key is missing or of any other type.
int32_t readInteger(const json_t* root, const char* key, int32_t fallback);

// An option that does what its kind's description says. A kind adds its own code where it is peculiar.
class DescribedOption : public Option {
 public:
  int parse(const char* text) final;
  void setProperty(ctx_option_t** out) final;

  const OptionDescription& description() const { return described; }
  int32_t setting(size_t key) const { return settings[key]; }

 protected:
  static constexpr size_t kMostKeys = 7;
  using Values = std::array<int32_t, kMostKeys>;

  explicit DescribedOption(const OptionDescription& description);
  // Copies the settings but not the property list's values, which belong to the option that rendered them.
  DescribedOption(const DescribedOption& other);
  DescribedOption& operator=(const DescribedOption&) = delete;

  // Called at the end of a successful parse, with the values as they were read.
  virtual void adjust(const Values& /*read*/) {}
  // The value of a property that shows no single setting.
  virtual int32_t computeProperty(int32_t /*id*/) const { return 0; }

  Values settings{};

 private:
  const OptionDescription& described;
  Values mirrors{};  // what the entries of the last property list point at
};

// A kind's class: its description and what they all have in common.
template <class Kind, const OptionDescription& kDescription>
class OptionKind : public DescribedOption {
 public:
  static constexpr const OptionDescription& kind = kDescription;

  OptionKind() : DescribedOption(kDescription) {}
  std::unique_ptr<Option> clone() const override { return std::make_unique<Kind>(static_cast<const Kind&>(*this)); }

  // The rules are known to the compiler here: a negotiation merges once for each session of the sensor.
  void merge(const Option& other) override {
    const auto& that = static_cast<const OptionKind&>(other);
    for (size_t i = 0; i < kDescription.keys.size(); ++i) {
      settings[i] = merged(kDescription.keys[i].merge, settings[i], that.settings[i]);
    }
  }
};

}  // namespace senseloom
