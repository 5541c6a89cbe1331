// What all option kinds have in common, checked on every kind.

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <iterator>
#include <limits>
#include <memory>
#include <optional>
#include <ostream>
#include <string>
#include <utility>
#include <vector>

#include "allocations.h"
#include "option/option_kinds.h"
#include "option_contract_kinds.h"
#include "option_test_support.h"

namespace senseloom {
namespace {

constexpr int32_t kMin = std::numeric_limits<int32_t>::min();
constexpr int32_t kMax = std::numeric_limits<int32_t>::max();

std::string withValue(std::string message, const std::string& value) {
  return message.replace(message.find('%'), 1, value);
}

// What a string did to an option.
struct Outcome {
  int result;
  Values settings;
  std::vector<fake::LogLine> log;
  bool operator==(const Outcome&) const = default;
};
void PrintTo(const Outcome& outcome, std::ostream* out) {
  *out << "result " << outcome.result << ", settings " << testing::PrintToString(outcome.settings) << ", log "
       << testing::PrintToString(outcome.log);
}

class OptionContract : public testing::TestWithParam<Kind> {
 protected:
  const Kind& kind = GetParam();

  // A string with a JSON text a key, some of them none.
  std::string object(const std::vector<std::optional<std::string>>& texts) const {
    std::string members;
    for (size_t i = 0; i < texts.size(); ++i) {
      if (texts[i]) members += (members.empty() ? "\"" : ",\"") + kind.keys[i].name + "\":" + *texts[i];
    }
    return "{" + members + "}";
  }
  std::string object(const Values& values) const {
    std::vector<std::optional<std::string>> texts;
    for (const int32_t value : values) texts.emplace_back(std::to_string(value));
    return object(texts);
  }
  // The common string with another text for one key, or none.
  std::string commonBut(size_t key, const std::optional<std::string>& text) const {
    std::vector<std::optional<std::string>> texts;
    for (const int32_t value : kind.common) texts.emplace_back(std::to_string(value));
    texts[key] = text;
    return object(texts);
  }

  Values defaults() const {
    Values values;
    for (const Key& key : kind.keys) values.push_back(key.defaultValue);
    return values;
  }
  Values commonBut(size_t key, int32_t setting) const {
    Values values = kind.common;
    values[key] = setting;
    return values;
  }

  size_t indexOf(const std::string& key) const {
    return static_cast<size_t>(std::ranges::find(kind.keys, key, &Key::name) - kind.keys.begin());
  }

  std::vector<fake::LogLine> lines(const std::vector<std::string>& texts) const {
    std::vector<fake::LogLine> lines;
    for (const auto& text : texts) lines.push_back({kError, kind.tag, text});
    return lines;
  }
  std::vector<fake::LogLine> rejection(size_t key, int32_t value) const {
    const std::string& message = kind.keys[key].message;
    return message.empty() ? std::vector<fake::LogLine>{} : lines({withValue(message, std::to_string(value))});
  }
  std::vector<fake::LogLine> unparsable(const std::string& text) const {
    return kind.unparsable.empty() ? std::vector<fake::LogLine>{} : lines({withValue(kind.unparsable, text)});
  }
  std::vector<Property> commonProperties() const {
    std::vector<Property> properties;
    for (const auto& [id, value] : kind.properties) properties.push_back({id, 4, value});
    return properties;
  }

  Outcome parse(Option& option, const char* text) const {
    fake::platform().takeLog();
    const int result = option.parse(text);
    return {result, kind.settings(option), fake::platform().takeLog()};
  }
  Outcome parse(Option& option, const std::string& text) const { return parse(option, text.c_str()); }
  // ... to a new option.
  Outcome parse(const std::string& text) const { return parse(*kind.make(), text); }

  std::unique_ptr<Option> parsed(const Values& values) const {
    auto option = kind.make();
    EXPECT_EQ(option->parse(object(values).c_str()), 0) << object(values);
    return option;
  }
  std::unique_ptr<Option> common() const { return parsed(kind.common); }

  // Runs `check(index)` for each key of the kind.
  template <class Check>
  void forEachKey(Check check) const {
    for (size_t key = 0; key < kind.keys.size(); ++key) {
      SCOPED_TRACE(kind.keys[key].name);
      check(key);
    }
  }

  // The library's own description of the kind.
  const OptionDescription& description() const {
    return **std::ranges::find(kOptionKinds, std::string(kind.sensor),
                               [](const OptionDescription* each) { return std::string(each->sensor); });
  }
};

INSTANTIATE_TEST_SUITE_P(Sensor, OptionContract, testing::ValuesIn(expectedKinds()),
                         [](const auto& instance) { return std::string(instance.param.sensor); });

TEST(OptionKinds, AreTheTwelveInTheOrderOfTheRegistry) {
  std::vector<std::string> described;
  for (const OptionDescription* description : kOptionKinds) described.emplace_back(description->sensor);
  EXPECT_EQ(described, (std::vector<std::string>{"PHYAC", "STAP", "GSFLK", "SHAKI", "ISACT", "SCOUN", "GSPX", "DTWGS",
                                                 "GSETH", "LPE_P", "PDR", "LIFT"}));
  std::vector<std::string> tested;
  for (const Kind& kind : expectedKinds()) tested.emplace_back(kind.sensor);
  EXPECT_EQ(tested, described);
}

TEST_P(OptionContract, DescriptionTellsTheKeys) {
  ASSERT_EQ(description().keys.size(), kind.keys.size());
  forEachKey([&](size_t i) {
    const OptionKey& described = description().keys[i];
    const Key& key = kind.keys[i];
    EXPECT_EQ(described.name, key.name);
    EXPECT_EQ(described.defaultValue, key.defaultValue);
    EXPECT_EQ(described.range.low, key.range.low);
    EXPECT_EQ(described.range.high, key.range.high);
    EXPECT_EQ(described.outOfRange, key.outOfRange);
    EXPECT_EQ(described.fallback, key.fallback);
    EXPECT_EQ(described.message != nullptr ? described.message : "",
              key.message.empty() ? "" : withValue(key.message, "%d"));
    EXPECT_EQ(described.merge, key.merge);
  });
  const auto& stringKeys = description().stringKeys;
  EXPECT_EQ(std::vector<std::string>(stringKeys.begin(), stringKeys.end()), kind.stringKeys);
}

TEST_P(OptionContract, DescriptionTellsThePropertiesAndTheLog) {
  std::vector<int32_t> ids;
  std::vector<int> keys;
  for (const OptionProperty& property : description().properties) {
    ids.push_back(property.id);
    keys.push_back(property.key);
  }
  EXPECT_EQ(ids, kind.describedIds);
  EXPECT_EQ(keys, kind.describedKeys);
  EXPECT_EQ(description().logTag, kind.tag);
  EXPECT_EQ(description().unparsableMessage != nullptr ? description().unparsableMessage : "",
            kind.unparsable.empty() ? "" : withValue(kind.unparsable, "%s"));
  EXPECT_EQ(description().unparsableResult, kind.unparsableResult);
  EXPECT_EQ(description().nullIsUnparsable, kind.nullIsLogged);
}

TEST_P(OptionContract, NewOptionEmptyObjectAndTopLevelArrayHaveTheDefaults) {
  EXPECT_EQ(kind.settings(*kind.make()), defaults());
  const int result = kind.takesEmptyObject ? 0 : -1;
  for (const char* text : {"{}", " { } ", "[]", "[1, {\"classMask\": 1}]"}) {
    SCOPED_TRACE(text);
    EXPECT_EQ(parse(text), (Outcome{result, defaults(), lines(kind.loggedOfEmptyObject)}));
    EXPECT_EQ(parse(*common(), text),
              (Outcome{result, kind.takesEmptyObject ? defaults() : kind.common, lines(kind.loggedOfEmptyObject)}));
  }
}

TEST_P(OptionContract, TakesValuesUpToTheBoundsSilently) {
  EXPECT_EQ(parse(object(kind.common)), (Outcome{0, kind.common, lines(kind.loggedOfCommon)}));
  for (const auto& [name, values] : kind.taken) {
    const size_t key = indexOf(name);
    for (const int32_t value : values) {
      const std::string text = commonBut(key, std::to_string(value));
      EXPECT_EQ(parse(text), (Outcome{0, commonBut(key, value), {}})) << text;
    }
  }
}

TEST_P(OptionContract, LogsAndReplacesAValueOutOfRangeOrRefusesTheString) {
  const auto check = [&](size_t key, int32_t value, const Outcome& ofNew, const Outcome& ofCommon) {
    const std::string text = commonBut(key, std::to_string(value));
    EXPECT_EQ(parse(text), ofNew) << text;
    EXPECT_EQ(parse(*common(), text), ofCommon) << text << " given to an option that holds values";
  };
  const auto checkTaken = [&](size_t key, int32_t value, const Values& settings) {
    const Outcome outcome{0, settings, rejection(key, value)};
    check(key, value, outcome, outcome);
  };
  for (const auto& [name, stored, values] : kind.replaced) {
    const size_t key = indexOf(name);
    for (const int32_t value : values) checkTaken(key, value, commonBut(key, stored));
  }
  for (const auto& [name, value, settings] : kind.particular) checkTaken(indexOf(name), value, settings);
  for (const auto& [name, values] : kind.refused) {
    const size_t key = indexOf(name);
    for (const int32_t value : values) {
      check(key, value, {-1, defaults(), rejection(key, value)}, {-1, kind.common, rejection(key, value)});
    }
  }
}

TEST_P(OptionContract, MissingKeyHasItsDefault) {
  forEachKey([&](size_t i) {
    EXPECT_EQ(parse(commonBut(i, std::nullopt)), parse(commonBut(i, std::to_string(kind.keys[i].defaultValue))));
  });
}

TEST_P(OptionContract, ValueOfAnotherTypeCountsAsMissing) {
  forEachKey([&](size_t i) {
    const Outcome missing = parse(commonBut(i, std::nullopt));
    for (const char* text :
         {R"("3")", R"("")", "2.0", "1e0", "-0.0", "true", "false", "null", "{}", R"({"value":1})", "[]", "[1]"}) {
      EXPECT_EQ(parse(commonBut(i, text)), missing) << text;
    }
  });
}

TEST_P(OptionContract, UnknownKeysAreIgnored) {
  const std::string known = object(kind.common);
  for (const char* unknown : {R"("unknown":1)", R"("":0)", R"("ClassMask":0,"LEVEL":9,"Mode":3)", R"("classMask ":0)",
                              R"("unknown":{"mode":7,"classMask":0,"level":9})", R"("unknown":[null,"text",1.5])"}) {
    const std::string text = known.substr(0, known.size() - 1) + "," + unknown + "}";
    EXPECT_EQ(parse(text), (Outcome{0, kind.common, lines(kind.loggedOfCommon)})) << text;
  }
}

TEST_P(OptionContract, IntegersAreCutTo32Bits) {
  const std::pair<const char*, int32_t> cases[] = {
      {"2147483648", kMin}, {"-2147483649", kMax},       {"4294967295", -1},
      {"4294967296", 0},    {"4294967297", 1},           {"-4294967295", 1},
      {"4294967298", 2},    {"9223372036854775807", -1}, {"-9223372036854775808", 0},
  };
  forEachKey([&](size_t i) {
    for (const auto& [text, cut] : cases) {
      EXPECT_EQ(parse(commonBut(i, text)), parse(commonBut(i, std::to_string(cut)))) << text;
    }
  });
}

TEST_P(OptionContract, LastOfTwoValuesOfAKeyCounts) {
  forEachKey([&](size_t i) {
    const std::string again = ",\"" + kind.keys[i].name + "\":";
    EXPECT_EQ(parse(commonBut(i, "2" + again + "1")), parse(commonBut(i, "1")));
    EXPECT_EQ(parse(commonBut(i, "1" + again + "\"2\"")), parse(commonBut(i, std::nullopt)));
  });
}

TEST_P(OptionContract, TextThatIsNoJsonChangesNothing) {
  std::vector<std::string> texts = {
      "", " ", "no JSON", "{", "{} {}", "3", "\"text\"", "null", "{'classMask':1}", "{\"classMask\":1,}"};
  texts.push_back(std::string(3000, '[') + std::string(3000, ']'));  // nests deeper than the parser follows
  forEachKey([&](size_t i) {
    texts.push_back(commonBut(i, "9223372036854775808"));  // of more than 64 bits
    texts.push_back(commonBut(i, "-9223372036854775809"));
    texts.push_back(commonBut(i, "01"));
  });
  for (const std::string& text : texts) {
    SCOPED_TRACE(text);
    const auto option = common();
    const PropertyList list = listOf(*option);
    EXPECT_EQ(parse(text), (Outcome{kind.unparsableResult, defaults(), unparsable(text)}));
    EXPECT_EQ(parse(*option, text), (Outcome{kind.unparsableResult, kind.common, unparsable(text)}));
    EXPECT_EQ(entriesOf(list), commonProperties());
    EXPECT_EQ(entriesOf(listOf(*option)), commonProperties());
  }
}

TEST_P(OptionContract, NullTextChangesNothing) {
  const auto logged = kind.nullIsLogged ? unparsable("(null)") : std::vector<fake::LogLine>{};
  const char* none = nullptr;
  const auto option = common();
  const PropertyList list = listOf(*option);
  EXPECT_EQ(parse(*kind.make(), none), (Outcome{kind.unparsableResult, defaults(), logged}));
  EXPECT_EQ(parse(*option, none), (Outcome{kind.unparsableResult, kind.common, logged}));
  EXPECT_EQ(entriesOf(list), commonProperties());
  EXPECT_EQ(entriesOf(listOf(*option)), commonProperties());
}

TEST_P(OptionContract, RendersItsPropertiesInOrder) {
  const auto option = common();
  fake::platform().takeLog();
  const PropertyList list = listOf(*option);
  EXPECT_EQ(entriesOf(list), commonProperties());
  EXPECT_EQ(entriesOf(listOf(*option)), commonProperties()) << "a second time";
  option->setProperty(nullptr);
  EXPECT_EQ(entriesOf(list), commonProperties()) << "after there was no place for a list";
  EXPECT_EQ(kind.settings(*option), kind.common);
  EXPECT_TRUE(fake::platform().log.empty());
}

TEST_P(OptionContract, RendersNullWhenMemoryRanOut) {
  const auto option = common();
  const PropertyList other(Option::newOption(0));
  ctx_option_t* list = other.get();
  {
    const fake::FailingAllocation memory(1);
    option->setProperty(&list);
  }
  EXPECT_EQ(list, nullptr);
  EXPECT_EQ(entriesOf(listOf(*option)), commonProperties());
}

TEST_P(OptionContract, ValuesOfAListAreZeroAfterTheNextString) {
  const auto option = common();
  const PropertyList list = listOf(*option);
  ASSERT_EQ(option->parse(object(kind.common).c_str()), 0);
  std::vector<Property> zeroed;
  for (const auto& [id, value] : kind.properties) zeroed.push_back({id, 4, 0});
  EXPECT_EQ(entriesOf(list), zeroed);
}

TEST_P(OptionContract, MergesByTheRulesOfItsKeys) {
  for (const Merging& merging : kind.mergings) {
    const auto option = parsed(merging.mine);
    const auto other = parsed(merging.other);
    const Values otherSettings = kind.settings(*other);
    fake::platform().takeLog();
    option->merge(*other);
    EXPECT_EQ(kind.settings(*option), merging.merged) << object(merging.mine) << " with " << object(merging.other);
    EXPECT_EQ(kind.settings(*other), otherSettings);
    EXPECT_TRUE(fake::platform().log.empty());
  }
}

TEST_P(OptionContract, MergingLeavesTheValuesOfAListAlone) {
  for (const Merging& merging : kind.mergings) {
    const auto option = common();
    const auto other = parsed(merging.mine);
    const PropertyList list = listOf(*option);
    const PropertyList otherList = listOf(*other);
    const auto otherEntries = entriesOf(otherList);
    option->merge(*other);
    EXPECT_EQ(entriesOf(list), commonProperties());
    EXPECT_EQ(entriesOf(otherList), otherEntries);
  }
}

TEST_P(OptionContract, CloneHasTheSettingsAndListsOfItsOwn) {
  auto option = common();
  const PropertyList list = listOf(*option);
  fake::platform().takeLog();
  const auto copy = option->clone();
  EXPECT_TRUE(fake::platform().log.empty());
  EXPECT_EQ(kind.settings(*copy), kind.cloned.empty() ? kind.common : kind.cloned);

  const PropertyList listOfCopy = listOf(*copy);
  EXPECT_EQ(entriesOf(listOfCopy), commonProperties());
  ASSERT_EQ(listOfCopy->count, list->count);
  for (int i = 0; i < list->count; ++i) EXPECT_NE(listOfCopy->properties[i].value, list->properties[i].value);

  ASSERT_EQ(copy->parse(object(kind.mergings[0].mine).c_str()), 0);
  EXPECT_EQ(entriesOf(list), commonProperties());
  EXPECT_EQ(kind.settings(*option), kind.common);

  const auto last = option->clone();
  option.reset();
  EXPECT_EQ(entriesOf(listOf(*last)), commonProperties()) << "when the original is gone";
}

}  // namespace
}  // namespace senseloom
