// The descriptions of all kinds of options beside the table of the model, and what no caller of the library can see of
// an option.

#include <gtest/gtest.h>

#include <array>
#include <cstdint>
#include <limits>
#include <memory>
#include <string>
#include <vector>

#include "model/kinds.h"
#include "option/all_options.h"
#include "option_test_support.h"

namespace senseloom {
namespace {

static_assert(std::size(kOptionDescriptions) == model::kKinds, "the model knows every kind");

template <class Kind>
std::unique_ptr<Option> make() {
  return std::make_unique<Kind>();
}
constexpr std::unique_ptr<Option> (*kMake[])() = {
#define SENSOR_KIND(SensorClass, SessionClass, OptionClass, BaseClass) make<OptionClass>,
#include "sensor_kinds.def"
#undef SENSOR_KIND
};

class OptionContract : public testing::TestWithParam<int> {
 protected:
  const int kind = GetParam();
  const model::KindRow& row = model::rowOf(kind);
  const OptionDescription& description = *kOptionDescriptions[static_cast<size_t>(kind)];

  // An option that has taken a string with a good value for every key, and the list that it renders.
  std::unique_ptr<Option> goodOption() const {
    auto option = kMake[kind]();
    EXPECT_EQ(option->parse(good().c_str()), 0);
    fake::platform().takeLog();
    return option;
  }
  std::string good() const {
    std::string members;
    for (const model::Key& key : row.keys) {
      const bool isBounded = key.low <= key.high && key.high != std::numeric_limits<int32_t>::max();
      members += (members.empty() ? "\"" : ",\"") + std::string(key.name) +
                 "\":" + std::to_string(isBounded ? key.high : key.defaultValue);
    }
    return "{" + members + "}";
  }
};

std::vector<int> allKinds() {
  std::vector<int> kinds;
  for (int kind = 0; kind < model::kKinds; ++kind) kinds.push_back(kind);
  return kinds;
}
INSTANTIATE_TEST_SUITE_P(Sensor, OptionContract, testing::ValuesIn(allKinds()),
                         [](const auto& instance) { return std::string(model::rowOf(instance.param).sensor); });

TEST_P(OptionContract, DescriptionTellsTheKeys) {
  EXPECT_STREQ(description.sensor, row.sensor);
  ASSERT_EQ(description.keys.size(), row.keys.size());
  for (size_t i = 0; i < row.keys.size(); ++i) {
    const OptionKey& described = description.keys[i];
    const model::Key& key = row.keys.begin()[i];
    SCOPED_TRACE(key.name);
    EXPECT_STREQ(described.name, key.name);
    EXPECT_EQ(described.defaultValue, key.defaultValue);
    EXPECT_EQ(described.range.low, key.low);
    EXPECT_EQ(described.range.high, key.high);
    EXPECT_EQ(described.fallback, key.fallback);
    EXPECT_STREQ(described.message, key.message);
    // Both name the same in the same order.
    EXPECT_EQ(static_cast<int>(described.outOfRange), static_cast<int>(key.outOfRange));
    EXPECT_EQ(static_cast<int>(described.merge), static_cast<int>(key.merge));
  }
  ASSERT_EQ(description.stringKeys.size(), row.stringKeys.size());
  for (size_t i = 0; i < row.stringKeys.size(); ++i) {
    EXPECT_STREQ(description.stringKeys[i], row.stringKeys.begin()[i].name);
  }
}

TEST_P(OptionContract, DescriptionTellsThePropertiesAndTheLog) {
  ASSERT_EQ(description.properties.size(), row.properties.size());
  for (size_t i = 0; i < row.properties.size(); ++i) {
    EXPECT_EQ(description.properties[i].id, row.properties.begin()[i].id);
    EXPECT_STREQ(description.properties[i].name, row.properties.begin()[i].name);
  }
  EXPECT_STREQ(description.logTag, row.tag);
  EXPECT_STREQ(description.unparsableMessage, row.notJson);
  // The step counter's option refuses what its session accepts.
  EXPECT_EQ(description.unparsableResult, row.acceptsNotJson && kind != model::scoun ? 0 : -1);
  EXPECT_EQ(description.nullIsUnparsable, kind == model::isact);
}

TEST_P(OptionContract, NullTextChangesNothing) {
  const auto option = goodOption();
  const PropertyList list = listOf(*option);
  const auto before = entriesOf(list);
  EXPECT_EQ(option->parse(nullptr), description.unparsableResult);
  std::vector<fake::LogLine> logged;
  if (kind == model::isact) {
    logged = {{kError, "STY", "instantactivity: invalid opton string (null), all set as default"}};
  }
  EXPECT_EQ(fake::platform().takeLog(), logged);
  EXPECT_EQ(entriesOf(list), before);
  EXPECT_EQ(entriesOf(listOf(*option)), before);
}

TEST_P(OptionContract, RendersTheSameAgainAndNothingWithoutAPlaceForIt) {
  const auto option = goodOption();
  const PropertyList list = listOf(*option);
  const auto entries = entriesOf(list);
  EXPECT_EQ(entriesOf(listOf(*option)), entries);
  option->setProperty(nullptr);
  EXPECT_EQ(entriesOf(list), entries);
  EXPECT_TRUE(fake::platform().log.empty());
}

TEST_P(OptionContract, ValuesOfAListAreZeroAfterTheNextString) {
  const auto option = goodOption();
  const PropertyList list = listOf(*option);
  ASSERT_EQ(option->parse(good().c_str()), 0);
  for (const Property& entry : entriesOf(list)) EXPECT_EQ(entry.value, 0) << entry.id;
}

TEST_P(OptionContract, CloneHasTheSettingsAndListsOfItsOwn) {
  auto option = goodOption();
  const PropertyList list = listOf(*option);
  const auto entries = entriesOf(list);
  const auto copy = option->clone();
  EXPECT_TRUE(fake::platform().takeLog().empty());
  const PropertyList listOfCopy = listOf(*copy);
  EXPECT_EQ(entriesOf(listOfCopy), entries);
  ASSERT_EQ(listOfCopy->count, list->count);
  for (int i = 0; i < list->count; ++i) EXPECT_NE(listOfCopy->properties[i].value, list->properties[i].value);

  ASSERT_EQ(copy->parse(good().c_str()), 0);
  EXPECT_EQ(entriesOf(list), entries);
  const auto last = option->clone();
  option.reset();
  EXPECT_EQ(entriesOf(listOf(*last)), entries) << "when the original is gone";
}

}  // namespace
}  // namespace senseloom
