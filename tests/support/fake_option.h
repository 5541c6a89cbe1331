#pragma once

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "option/option.h"

namespace fake {

// An option that tells what happens to it in words, "a merges b". The copy of "a" is "a'".
class NamedOption final : public senseloom::Option {
 public:
  using Events = std::vector<std::string>;

  NamedOption(std::string ownName, Events& story) : name(std::move(ownName)), events(story) {}
  ~NamedOption() override { events.push_back(name + " destroyed"); }

  int parse(const char* text) override {
    events.push_back(name + " parses " + (text != nullptr ? text : "null"));
    return parseResult;
  }
  void merge(const Option& other) override {
    events.push_back(name + " merges " + static_cast<const NamedOption&>(other).name);
  }
  std::unique_ptr<Option> clone() const override {
    events.push_back(name + " cloned");
    auto copy = std::make_unique<NamedOption>(name + "'", events);
    copy->renders = renders;
    return copy;
  }
  void setProperty(ctx_option_t** out) override {
    events.push_back(name + " rendered");
    *out = renders ? newOption(1) : nullptr;
    fillOptionAt(*out, 0, 7, this, static_cast<int>(sizeof *this));
  }

  const std::string name;
  int parseResult = 0;
  bool renders = true;  // copies render as their original does

 private:
  Events& events;
};

}  // namespace fake
