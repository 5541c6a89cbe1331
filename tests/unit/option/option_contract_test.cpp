// What all kinds of option have in common, checked on every kind against the model of the library.

#include <gtest/gtest.h>

#include <array>
#include <cstdint>
#include <limits>
#include <memory>
#include <optional>
#include <ostream>
#include <set>
#include <string>
#include <vector>

#include "library_memory.h"
#include "model/kinds.h"
#include "model/merging.h"
#include "model/option_reading.h"
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

// What a string did to an option, and the list that it renders now; no list: null.
struct Seen {
  int result;
  std::vector<fake::LogLine> log;
  std::optional<model::PropertyList> list;
  bool operator==(const Seen&) const = default;
};
void PrintTo(const Seen& seen, std::ostream* out) {
  *out << "result " << seen.result << ", log " << testing::PrintToString(seen.log) << ", list";
  if (!seen.list) *out << " null";
  if (!seen.list) return;
  for (const auto& entry : *seen.list) *out << ' ' << entry.id << '=' << testing::PrintToString(entry.value);
}

std::optional<model::PropertyList> contentOf(const PropertyList& list) {
  if (list == nullptr) return std::nullopt;
  model::PropertyList entries;
  for (int i = 0; i < list->count; ++i) {
    const ctx_property_t& entry = list->properties[i];
    entries.push_back({entry.id, {static_cast<const char*>(entry.value), static_cast<size_t>(entry.size)}});
  }
  return entries;
}

// An option of the library, and what the model has in its place.
class Both {
 public:
  explicit Both(int kind) : option(kMake[kind]()), request(kind) {}

  Seen parse(const std::string& text) {
    fake::platform().takeLog();
    const int result = option->parse(text.c_str());
    auto list = contentOf(listOf(*option));
    return {result, fake::platform().takeLog(), std::move(list)};
  }
  Seen expected(const std::string& text) {
    model::Log log;
    const bool isTaken = model::readOption(request, text.c_str(), true, {templates, log, nullptr});
    auto list = rendered(model::Merged(request), log);
    std::vector<fake::LogLine> lines;
    for (const auto& [priority, tag, line] : log) lines.push_back({priority, tag, line});
    return {isTaken ? 0 : -1, lines, std::move(list)};
  }
  std::optional<model::PropertyList> rendered(const model::Merged& merged, model::Log& log) const {
    std::optional<model::Remark> conflict;
    auto list = merged.render(templates, log, conflict);
    if (!list) return std::nullopt;
    for (auto& entry : *list) entry.slot = -1;
    return list;
  }

  std::unique_ptr<Option> option;
  model::Request request;
  model::Templates templates;
};

class OptionContract : public testing::TestWithParam<int> {
 protected:
  const int kind = GetParam();
  const model::KindRow& row = model::rowOf(kind);
  const OptionDescription& description = *kOptionDescriptions[static_cast<size_t>(kind)];

  // A string in which every key has a value in its range, but for one that has another text, or none.
  std::string object(const std::string& other = "", const std::optional<std::string>& text = std::nullopt) const {
    std::string members;
    for (const model::Key& key : row.keys) {
      const bool isOther = key.name == other;
      if (isOther && !text) continue;
      members += (members.empty() ? "\"" : ",\"") + std::string(key.name) + "\":";
      members += isOther ? *text : std::to_string(goodValue(key));
    }
    return "{" + members + "}";
  }
  std::string good() const { return object(); }

  static int32_t goodValue(const model::Key& key) {
    if (key.low > key.high) return key.defaultValue;
    return key.high == std::numeric_limits<int32_t>::max() ? 7 : key.high;
  }

  std::unique_ptr<Option> goodOption() const {
    auto option = kMake[kind]();
    EXPECT_EQ(option->parse(good().c_str()), 0);
    fake::platform().takeLog();
    return option;
  }

  // Gives the string to a new option and to one that holds values.
  void check(const std::string& text) const {
    SCOPED_TRACE(text);
    Both fresh(kind);
    EXPECT_EQ(fresh.parse(text), fresh.expected(text));
    Both used(kind);
    EXPECT_EQ(used.parse(good()), used.expected(good()));
    EXPECT_EQ(used.parse(text), used.expected(text));
  }

  // Values at the bounds of the keys and around them, and those that have to be cut to 32 bits.
  std::set<int64_t> values() const {
    std::set<int64_t> all = {-2147483649, -4294967295, 2147483648, 4294967295, 4294967296, 4294967298};
    all.insert(std::numeric_limits<int64_t>::min());
    all.insert(std::numeric_limits<int64_t>::max());
    for (int64_t value = -9; value <= 9; ++value) all.insert(value);
    for (const model::Key& key : row.keys) {
      for (const int64_t bound : {key.low, key.high}) all.insert({bound - 1, bound, bound + 1});
    }
    return all;
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
  EXPECT_EQ(std::vector<std::string>(description.stringKeys.begin(), description.stringKeys.end()),
            std::vector<std::string>(row.stringKeys.begin(), row.stringKeys.end()));
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

TEST_P(OptionContract, TakesReplacesOrRefusesEachValueOfEachKey) {
  check(good());
  for (const model::Key& key : row.keys) {
    check(object(key.name));
    for (const int64_t value : values()) check(object(key.name, std::to_string(value)));
    for (const char* text :
         {R"("3")", R"("")", "2.0", "1e0", "-0.0", "true", "false", "null", "{}", R"({"value":1})", "[]", "[1]"}) {
      check(object(key.name, text));
    }
    const std::string again = ",\"" + std::string(key.name) + "\":";
    check(object(key.name, "2" + again + "1"));
    check(object(key.name, "1" + again + "\"2\""));
  }
}

TEST_P(OptionContract, ReadsAnyStringAsTheModelDoes) {
  const std::string known = good().substr(0, good().size() - 1);
  for (const char* unknown : {R"("unknown":1)", R"("":0)", R"("ClassMask":0,"LEVEL":9,"Mode":3)", R"("classMask ":0)",
                              R"("unknown":{"mode":7,"classMask":0,"level":9})", R"("unknown":[null,"text",1.5])"}) {
    check(known + "," + unknown + "}");
  }
  for (const char* text : {"{}", " { } ", "[]", "[1, {\"classMask\": 1}]"}) check(text);
}

TEST_P(OptionContract, TextThatIsNotJsonChangesNothing) {
  std::vector<std::string> texts = {
      "", " ", "no JSON", "{", "{} {}", "3", "\"text\"", "null", "{'classMask':1}", "{\"classMask\":1,}"};
  texts.push_back(std::string(3000, '[') + std::string(3000, ']'));  // nests deeper than the parser follows
  for (const model::Key& key : row.keys) {
    for (const char* number : {"9223372036854775808", "-9223372036854775809", "01", "1e999"}) {
      texts.push_back(object(key.name, number));
    }
  }
  for (const std::string& text : texts) {
    SCOPED_TRACE(text);
    Both both(kind);
    EXPECT_EQ(both.parse(good()), both.expected(good()));
    const PropertyList list = listOf(*both.option);
    const auto before = entriesOf(list);
    Seen expected = both.expected(text);
    expected.result = description.unparsableResult;
    EXPECT_EQ(both.parse(text), expected);
    EXPECT_EQ(entriesOf(list), before);
  }
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

TEST_P(OptionContract, RendersNullWhenMemoryRanOut) {
  const auto option = goodOption();
  const PropertyList other(Option::newOption(0));
  ctx_option_t* list = other.get();
  {
    const memory::FailingAllocation first(1);
    option->setProperty(&list);
  }
  EXPECT_EQ(list, nullptr);
  EXPECT_NE(listOf(*option), nullptr);
}

TEST_P(OptionContract, ValuesOfAListAreZeroAfterTheNextString) {
  const auto option = goodOption();
  const PropertyList list = listOf(*option);
  ASSERT_EQ(option->parse(good().c_str()), 0);
  for (const Property& entry : entriesOf(list)) EXPECT_EQ(entry.value, 0) << entry.id;
}

TEST_P(OptionContract, MergesAsTheModelDoes) {
  std::vector<std::string> texts = {good()};
  for (const model::Key& key : row.keys) {
    for (const int64_t value : {int64_t{key.low}, int64_t{key.low} + 1, int64_t{key.defaultValue}, int64_t{1}}) {
      texts.push_back(object(key.name, std::to_string(value)));
    }
  }
  for (const std::string& mine : texts) {
    for (const std::string& theirs : texts) {
      SCOPED_TRACE(mine + " with " + theirs);
      Both one(kind);
      Both other(kind);
      EXPECT_EQ(one.parse(mine), one.expected(mine));
      EXPECT_EQ(other.parse(theirs), other.expected(theirs));
      const PropertyList list = listOf(*other.option);
      const auto before = contentOf(list);
      model::Merged merged(one.request);
      merged.merge(other.request);
      fake::platform().takeLog();
      one.option->merge(*other.option);
      EXPECT_TRUE(fake::platform().takeLog().empty());
      model::Log log;
      EXPECT_EQ(contentOf(listOf(*one.option)), one.rendered(merged, log));
      EXPECT_EQ(contentOf(list), before);
    }
  }
}

TEST_P(OptionContract, MergingLeavesTheValuesOfAListAlone) {
  const auto option = goodOption();
  const PropertyList list = listOf(*option);
  const auto entries = entriesOf(list);
  option->merge(*goodOption());
  option->merge(*kMake[kind]());
  EXPECT_EQ(entriesOf(list), entries);
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

  ASSERT_EQ(copy->parse(object(row.keys.begin()->name, "1").c_str()), 0);
  EXPECT_EQ(entriesOf(list), entries);
  const auto last = option->clone();
  option.reset();
  EXPECT_EQ(entriesOf(listOf(*last)), entries) << "when the original is gone";
}

}  // namespace
}  // namespace senseloom
