#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

#include "kinds.h"

namespace senseloom::model {

// The value of one key.
struct Requested {
  int32_t value = 0;       // that counts
  int32_t asked = 0;       // as it was given; the default when it was not
  bool isDefault = false;  // it was not given, or not as an integer

  std::string text() const;
  bool operator==(const Requested&) const = default;
};

// What one client asked for, key by key: at first the defaults.
class Request {
 public:
  explicit Request(int kind);
  bool operator==(const Request&) const = default;

  int kind() const { return ofKind; }
  Requested& operator[](std::string_view key) { return values[keyIndex(ofKind, key)]; }
  Requested& operator[](size_t key) { return values[key]; }
  const Requested& operator[](size_t key) const { return values[key]; }
  int32_t value(std::string_view key) const { return values[keyIndex(ofKind, key)].value; }

 private:
  int ofKind;
  std::array<Requested, kMostKeys> values{};
};

}  // namespace senseloom::model
