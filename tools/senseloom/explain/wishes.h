#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "sensors/option_data.h"

namespace senseloom::tool {

// What a session asks for under one key.
struct Wish {
  int32_t value;           // that counts
  int32_t asked;           // as it was given; the default when it was not
  bool isDefault = false;  // it was not given, or not as an integer

  std::string text() const;
};

// What a session asks for, key by key: at first the defaults.
class Wishes {
 public:
  explicit Wishes(const OptionDescription& description);

  const OptionDescription& kind() const { return *described; }
  Wish& operator[](std::string_view key);
  int32_t valueOf(std::string_view key) const { return (*this)[key].value; }
  const Wish& operator[](std::string_view key) const;
  const Wish& at(size_t key) const { return wishes[key]; }

 private:
  const OptionDescription* described;
  std::vector<Wish> wishes;
};

}  // namespace senseloom::tool
