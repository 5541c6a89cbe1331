#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <iterator>
#include <optional>
#include <ranges>
#include <senseloom.hpp>
#include <type_traits>
#include <utility>
#include <vector>

#include "bytes_of.h"

namespace {

using senseloom::Property;
using senseloom::PropertyList;
using senseloom::Session;

static_assert(!std::is_copy_constructible_v<PropertyList>);
static_assert(std::is_nothrow_move_constructible_v<PropertyList>);
static_assert(std::is_nothrow_move_assignable_v<PropertyList>);
static_assert(std::forward_iterator<PropertyList::Iterator>);
static_assert(std::ranges::forward_range<const PropertyList>);

int lists_released = 0;

Bytes bytesOf(const Property& property) {
  return {property.bytes().begin(), property.bytes().end()};
}

}  // namespace

// The linker has the program's calls come here first.
extern "C" {
int32_t __real_ctx_option_release(ctx_option_t* list);
int32_t __wrap_ctx_option_release(ctx_option_t* list) {
  ++lists_released;
  return __real_ctx_option_release(list);
}
}

namespace {

TEST(WrapperPropertyList, ListsThePropertiesInTheirOrder) {
  auto session = Session::open("PHYAC");
  const auto [accepted, properties] = session.setOption(R"({"mode": 1, "logN": 3, "classMask": 15})");
  ASSERT_TRUE(accepted);
  EXPECT_TRUE(properties);
  EXPECT_EQ(properties.size(), 4U);
  std::vector<int32_t> ids;
  std::vector<int32_t> values;
  for (const auto property : properties) {
    EXPECT_EQ(property.size(), 4U);
    ids.push_back(property.id());
    values.push_back(property.asInt().value());
  }
  EXPECT_EQ(ids, (std::vector<int32_t>{41, 43, 44, 42}));
  EXPECT_EQ(values, (std::vector<int32_t>{1, 0x80008, 8, 15}));
  EXPECT_EQ(properties[1].id(), 43);
  EXPECT_EQ(bytesOf(properties[1]), (Bytes{8, 0, 8, 0}));
}

TEST(WrapperPropertyList, IsARangeForAlgorithms) {
  auto session = Session::open("SCOUN");
  const auto [accepted, properties] = session.setOption(R"({"logN": 9})");
  ASSERT_TRUE(accepted);
  const auto isCount = [](const Property& property) { return property.id() == 142; };
  const auto found = std::find_if(properties.begin(), properties.end(), isCount);
  ASSERT_NE(found, properties.end());
  EXPECT_EQ((*found).asInt(), 9);
  EXPECT_EQ(std::ranges::distance(properties), 2);
  auto next = properties.begin();
  EXPECT_EQ((*next++).id(), 141);
  EXPECT_EQ(next, found);
}

TEST(WrapperPropertyList, HasNoIntegerForTheBytesOfAGestureTemplate) {
  auto session = Session::open("DTWGS");
  // Four bytes, the size of an integer.
  const auto [accepted, properties] = session.setOption(R"({"mode": 4, "classMask": 1, "template1": "000401020304"})");
  ASSERT_TRUE(accepted);
  ASSERT_EQ(properties.size(), 3U);
  EXPECT_EQ(properties[2].id(), 123);
  EXPECT_EQ(properties[2].asInt(), std::nullopt);
  EXPECT_EQ(bytesOf(properties[2]), (Bytes{1, 2, 3, 4}));
}

TEST(WrapperPropertyList, IsAListEvenWithoutProperties) {
  auto session = Session::open("GSPX");
  const auto [accepted, properties] = session.setOption("{}");
  ASSERT_TRUE(accepted);
  EXPECT_TRUE(properties);
  EXPECT_EQ(properties.size(), 0U);
  EXPECT_EQ(properties.begin(), properties.end());
}

TEST(WrapperPropertyList, IsAnEmptyRangeWhenThereIsNoList) {
  const PropertyList none;
  EXPECT_FALSE(none);
  EXPECT_EQ(none.size(), 0U);
  EXPECT_EQ(none.begin(), none.end());
  EXPECT_EQ(lists_released, 0);
}

TEST(WrapperPropertyList, IsReleasedOnceWhereverItWasMoved) {
  auto session = Session::open("SCOUN");
  {
    auto negotiated = session.setOption("{}");
    PropertyList moved = std::move(negotiated.properties);
    EXPECT_FALSE(negotiated.properties);  // NOLINT(bugprone-use-after-move): what is left is the question
    EXPECT_EQ(moved.size(), 2U);
    EXPECT_EQ(lists_released, 0);
  }
  EXPECT_EQ(lists_released, 1);
}

TEST(WrapperPropertyList, OfASessionThatIsDestroyedIsReleased) {
  auto other = Session::open("SCOUN");
  { auto session = Session::open("SCOUN"); }
  EXPECT_EQ(lists_released, 1);
}

}  // namespace
