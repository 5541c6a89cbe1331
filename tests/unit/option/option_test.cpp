#include <gtest/gtest.h>

#include <array>
#include <cstdint>
#include <cstring>
#include <limits>
#include <memory>
#include <ostream>
#include <vector>

#include "library_memory.h"
#include "option/option.h"

namespace senseloom {
namespace {

struct ListRelease {
  void operator()(ctx_option_t* list) const { ctx_option_release(list); }
};
using PropertyList = std::unique_ptr<ctx_option_t, ListRelease>;

struct Entry {
  int32_t id;
  int32_t size;
  void* value;
  bool operator==(const Entry&) const = default;
};
void PrintTo(const Entry& entry, std::ostream* out) {
  *out << "id " << entry.id << " size " << entry.size << " value " << entry.value;
}
constexpr Entry kEmpty{0, 0, nullptr};

std::vector<Entry> contents(const PropertyList& list) {
  std::vector<Entry> entries;
  for (int i = 0; i < list->count; ++i) {
    const ctx_property_t& entry = list->properties[i];
    entries.push_back({entry.id, entry.size, entry.value});
  }
  return entries;
}

TEST(PropertyLists, NewListHasTheCountAndEmptyEntries) {
  int32_t value = 0;
  {
    const PropertyList used(Option::newOption(3));
    for (int i = 0; i < 3; ++i) Option::fillOptionAt(used.get(), i, 7, &value, 4);
  }
  const PropertyList list(Option::newOption(3));  // likely in the same memory
  ASSERT_NE(list, nullptr);
  EXPECT_EQ(list->count, 3);
  EXPECT_EQ(contents(list), (std::vector<Entry>{kEmpty, kEmpty, kEmpty}));
}

TEST(PropertyLists, NewListOfNoEntriesIsAList) {
  const PropertyList list(Option::newOption(0));
  ASSERT_NE(list, nullptr);
  EXPECT_EQ(list->count, 0);
}

TEST(PropertyLists, NewListOfANegativeCountIsNullAndTakesNoMemory) {
  const memory::AllocationCount allocations;
  EXPECT_EQ(Option::newOption(-1), nullptr);
  EXPECT_EQ(Option::newOption(std::numeric_limits<int>::min()), nullptr);
  EXPECT_EQ(allocations.made(), 0U);
}

#if UINTPTR_MAX == UINT32_MAX

TEST(PropertyLists, NewListWhoseSizeTakesMoreThan32BitsIsNull) {
  EXPECT_EQ(Option::newOption(357913941), nullptr);  // 4 + 12 * 357913941 is 2^32
  EXPECT_EQ(Option::newOption(std::numeric_limits<int>::max()), nullptr);
}

// Callers of the 32-bit library read the list by these offsets.
TEST(PropertyLists, ListIsACountAndTwelveBytesAnEntry) {
  std::array<int32_t, 2> values{};
  const PropertyList list(Option::newOption(2));
  Option::fillOptionAt(list.get(), 0, 0x01020304, &values[0], 4);
  Option::fillOptionAt(list.get(), 1, -2, &values[1], 0x0384);

  std::array<uint8_t, 28> bytes;
  std::memcpy(bytes.data(), list.get(), bytes.size());
  // clang-format off
  std::array<uint8_t, 28> expected = {
      2, 0, 0, 0,                                        // count
      4, 3, 2, 1,  4, 0, 0, 0,  0, 0, 0, 0,              // id, size, value
      0xfe, 0xff, 0xff, 0xff,  0x84, 3, 0, 0,  0, 0, 0, 0};  // id, size, value
  // clang-format on
  const void* addresses[] = {&values[0], &values[1]};
  std::memcpy(&expected[12], &addresses[0], 4);
  std::memcpy(&expected[24], &addresses[1], 4);
  EXPECT_EQ(bytes, expected);
}

#endif

TEST(PropertyLists, FillWritesOneEntryAndNoOther) {
  std::array<int32_t, 2> values{};
  const PropertyList list(Option::newOption(3));
  Option::fillOptionAt(list.get(), 2, 41, &values[0], 4);
  EXPECT_EQ(contents(list), (std::vector<Entry>{kEmpty, kEmpty, {41, 4, &values[0]}}));
  Option::fillOptionAt(list.get(), 0, -7, &values[1], 900);
  EXPECT_EQ(contents(list), (std::vector<Entry>{{-7, 900, &values[1]}, kEmpty, {41, 4, &values[0]}}));
  Option::fillOptionAt(list.get(), 2, 0, nullptr, 0);
  EXPECT_EQ(contents(list), (std::vector<Entry>{{-7, 900, &values[1]}, kEmpty, kEmpty}));
  EXPECT_EQ(list->count, 3);
}

TEST(PropertyLists, FillOutsideTheListDoesNothing) {
  int32_t value = 0;
  const PropertyList list(Option::newOption(2));
  for (const int index : {-1, 2, 3, std::numeric_limits<int>::min(), std::numeric_limits<int>::max()}) {
    Option::fillOptionAt(list.get(), index, 41, &value, 4);
    EXPECT_EQ(list->count, 2);
    EXPECT_EQ(contents(list), (std::vector<Entry>{kEmpty, kEmpty})) << index;
  }
  const PropertyList none(Option::newOption(0));
  Option::fillOptionAt(none.get(), 0, 41, &value, 4);
  EXPECT_EQ(none->count, 0);
}

// The count and not the block decides which entries there are.
TEST(PropertyLists, FillHeedsTheCountAsItIsNow) {
  int32_t value = 0;
  const PropertyList list(Option::newOption(2));
  list->count = 1;
  Option::fillOptionAt(list.get(), 1, 41, &value, 4);
  list->count = 2;
  EXPECT_EQ(contents(list), (std::vector<Entry>{kEmpty, kEmpty}));
}

TEST(PropertyLists, FillOfNoListDoesNothing) {
  int32_t value = 5;
  Option::fillOptionAt(nullptr, 0, 41, &value, 4);
  EXPECT_EQ(value, 5);
}

}  // namespace
}  // namespace senseloom
