#pragma once

#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <ostream>
#include <string>
#include <vector>

#include "fake_platform.h"
#include "option/option.h"
#include "senseloom.h"

// What the tests of the option kinds share.
namespace senseloom {

inline constexpr int kError = 6;
inline constexpr int kDebug = 3;

// Starts each test with an empty log and the fakes as they are at first.
class OptionTest : public testing::Test {
 protected:
  OptionTest() { fake::platform() = {}; }
};

struct ListRelease {
  void operator()(ctx_option_t* list) const { ctx_option_release(list); }
};
using PropertyList = std::unique_ptr<ctx_option_t, ListRelease>;

// The list that the option renders. What it is stored over is no null pointer, so null tells that null was stored.
inline PropertyList listOf(Option& option) {
  const PropertyList other(Option::newOption(0));
  ctx_option_t* list = other.get();
  option.setProperty(&list);
  EXPECT_NE(list, other.get());
  return PropertyList(list != other.get() ? list : nullptr);
}

struct Property {
  int32_t id;
  int32_t size;
  int32_t value;
  bool operator==(const Property&) const = default;
};
inline void PrintTo(const Property& property, std::ostream* out) {
  *out << "id " << property.id << " size " << property.size << " value " << property.value;
}

inline int32_t intAt(const ctx_property_t& entry) {
  return *static_cast<const int32_t*>(entry.value);
}

// The entries of a list whose values are integers, as they read now.
inline std::vector<Property> entriesOf(const PropertyList& list) {
  std::vector<Property> entries;
  if (list == nullptr) {
    ADD_FAILURE() << "there is no list";
    return entries;
  }
  for (int i = 0; i < list->count; ++i) {
    const ctx_property_t& entry = list->properties[i];
    entries.push_back({entry.id, entry.size, intAt(entry)});
  }
  return entries;
}

// An option that was given a string that it takes.
template <class Kind>
Kind parsed(const std::string& text) {
  Kind option;
  EXPECT_EQ(option.parse(text.c_str()), 0) << text;
  return option;
}

inline fake::LogLine errorLine(const std::string& text) {
  return {kError, "libsenseloom", text};
}

}  // namespace senseloom
