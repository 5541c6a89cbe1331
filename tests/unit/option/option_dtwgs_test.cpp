#include "option/option_dtwgs.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <ostream>
#include <string>
#include <utility>
#include <vector>

#include "option_test_support.h"

namespace senseloom {
namespace {

using Templates = OptionDTWGS::DTWGSTemp;

bool isEmpty(const Templates::Slot& slot) {
  return slot.templateLength == 0 && std::ranges::count(slot.templateData, 0) == Templates::kCapacity;
}

// Before any test stores one.
TEST(GestureTemplates, AreNoneAtFirst) {
  for (const auto& slot : OptionDTWGS::tempInst.slots) EXPECT_TRUE(isEmpty(slot));
}

// The first bytes of a slot's data.
std::vector<uint8_t> head(const Templates::Slot& slot, size_t count) {
  return {slot.templateData.begin(), slot.templateData.begin() + static_cast<std::ptrdiff_t>(count)};
}

std::string repeated(const std::string& text, size_t times) {
  std::string all;
  for (size_t i = 0; i < times; ++i) all += text;
  return all;
}

class TemplateGestureOption : public OptionTest {
 protected:
  ~TemplateGestureOption() override { templates = {}; }

  Templates& templates = OptionDTWGS::tempInst;
};

using GestureTemplate = TemplateGestureOption;

TEST_F(GestureTemplate, TextIsFourDigitsOfLengthAndTwoAByte) {
  EXPECT_TRUE(templates.setTemplate(1, "0003a1b2c3"));
  EXPECT_EQ(templates.slots[0].templateLength, 3);
  EXPECT_EQ(head(templates.slots[0], 4), (std::vector<uint8_t>{0xa1, 0xb2, 0xc3, 0}));
  EXPECT_TRUE(isEmpty(templates.slots[1]));
}

TEST_F(GestureTemplate, LengthIsMostSignificantDigitFirst) {
  for (const auto& [text, length] : {std::pair{"0000", 0}, {"0001", 1}, {"0010", 16}, {"0123", 0x123}, {"0384", 900}}) {
    EXPECT_TRUE(templates.setTemplate(1, text)) << text;
    EXPECT_EQ(templates.slots[0].templateLength, length) << text;
  }
}

TEST_F(GestureTemplate, AnyNumberButOneStandsForTheSecondSlot) {
  for (const int which : {2, 0, -1, 3, 257}) {
    templates = {};
    EXPECT_TRUE(templates.setTemplate(which, "0001ff"));
    EXPECT_EQ(templates.slots[1].templateLength, 1) << which;
    EXPECT_EQ(templates.slots[1].templateData[0], 0xff) << which;
    EXPECT_TRUE(isEmpty(templates.slots[0])) << which;
  }
}

TEST_F(GestureTemplate, OddLastDigitIsDropped) {
  EXPECT_TRUE(templates.setTemplate(2, "0002a1b"));
  EXPECT_EQ(templates.slots[1].templateLength, 2);
  EXPECT_EQ(head(templates.slots[1], 2), (std::vector<uint8_t>{0xa1, 0}));
}

TEST_F(GestureTemplate, DeclaredLengthIsNotComparedWithTheBytesGiven) {
  EXPECT_TRUE(templates.setTemplate(1, "000101020304"));
  EXPECT_EQ(templates.slots[0].templateLength, 1);
  EXPECT_EQ(head(templates.slots[0], 5), (std::vector<uint8_t>{1, 2, 3, 4, 0}));
  EXPECT_TRUE(templates.setTemplate(1, "0384ee"));  // no more bytes: what was there stays
  EXPECT_EQ(templates.slots[0].templateLength, 900);
  EXPECT_EQ(head(templates.slots[0], 5), (std::vector<uint8_t>{0xee, 2, 3, 4, 0}));
}

TEST_F(GestureTemplate, OnlyLowercaseDigitsGiveTheirValue) {
  const std::pair<const char*, uint8_t> rows[] = {
      {"00", 0x00}, {"09", 0x09}, {"90", 0x90}, {"0a", 0x0a},
      {"0f", 0x0f}, {"f0", 0xf0}, {"ff", 0xff}, {"0A", 17},  // 'A' counts 65 - 48
      {"0F", 22},                                            //
      {"A0", 16},                                            // 17 * 16 in 8 bits
      {"AB", 34},                                            // 17 * 16 + 18
      {"0g", 16},                                            // 'g' counts 103 - 87
      {"gz", 35},                                            // 16 * 16 + 35
      {"/0", 0xf0},                                          // '/' counts -1
      {"0/", 0xff},                                          //
      {"0{", 75},                                            // '{', the character after 'z', counts 123 - 48
  };
  for (const auto& [digits, byte] : rows) {
    EXPECT_TRUE(templates.setTemplate(1, (std::string("0001") + digits).c_str())) << digits;
    EXPECT_EQ(templates.slots[0].templateData[0], byte) << digits;
  }
}

TEST_F(GestureTemplate, UppercaseLengthDigitsGiveAWrongLength) {
  EXPECT_TRUE(templates.setTemplate(1, "000A"));
  EXPECT_EQ(templates.slots[0].templateLength, 17);
  EXPECT_TRUE(templates.setTemplate(1, "00AA"));
  EXPECT_EQ(templates.slots[0].templateLength, 289);  // 17 * 16 + 17
}

TEST_F(GestureTemplate, SlotHolds900Bytes) {
  for (const char* odd : {"", "7"}) {
    templates = {};
    EXPECT_TRUE(templates.setTemplate(1, ("0384" + repeated("5c", 900) + odd).c_str()));
    EXPECT_EQ(templates.slots[0].templateLength, 900);
    EXPECT_EQ(std::ranges::count(templates.slots[0].templateData, 0x5c), 900);
    EXPECT_TRUE(isEmpty(templates.slots[1]));
  }
}

TEST_F(GestureTemplate, TextThatIsNoTemplateLeavesTheSlotsAsTheyAre) {
  ASSERT_TRUE(templates.setTemplate(1, "0002a1b2"));
  ASSERT_TRUE(templates.setTemplate(2, "0001c3"));
  const std::string tooLong = "0384" + repeated("5c", 901);
  const char* texts[] = {
      nullptr,         "",       "0", "000",  // fewer than 4 characters
      "0385ff",        "ffffff",              // a length above 900
      "/000ff",        "00/1ff",              // a length below 0: '/' counts -1
      tooLong.c_str(),                        // more than 900 bytes
  };
  for (const char* text : texts) {
    for (const int which : {1, 2}) {
      EXPECT_FALSE(templates.setTemplate(which, text)) << (text != nullptr ? text : "null");
      EXPECT_EQ(templates.slots[0].templateLength, 2);
      EXPECT_EQ(head(templates.slots[0], 3), (std::vector<uint8_t>{0xa1, 0xb2, 0}));
      EXPECT_EQ(templates.slots[1].templateLength, 1);
      EXPECT_EQ(head(templates.slots[1], 2), (std::vector<uint8_t>{0xc3, 0}));
    }
  }
}

TEST_F(TemplateGestureOption, ChecksWhatItsModeNeedsInOrder) {
  struct Row {
    const char* text;
    const char* message;  // null: accepted
  };
  const Row rows[] = {
      {R"({"mode":1})", nullptr},
      {R"({"mode":1,"classMask":0})", nullptr},
      {R"({"mode":1,"classMask":-1})", nullptr},
      {R"({"mode":1,"classMask":9,"level":9})", nullptr},
      {R"({"mode":1,"level":2})", nullptr},
      {R"({"mode":1,"classMask":3,"level":2})", nullptr},
      {R"({"mode":1,"index":1})", nullptr},
      {R"({"mode":1,"index":2})", "Invalid index value 2 at enroll mode"},
      {R"({"mode":1,"index":-1})", "Invalid index value -1 at enroll mode"},
      {R"({"mode":1,"classMask":4,"level":2,"index":7})", "Invalid index value 7 at enroll mode"},
      {R"({"mode":1,"index":4294967297})", nullptr},  // 1 in 32 bits
      {R"({"mode":4,"classMask":1})", nullptr},
      {R"({"mode":4,"classMask":3,"level":-1,"index":7})", nullptr},
      {R"({"mode":4})", "Invalid mask value 0 at match mode"},
      {R"({"mode":4,"classMask":4,"level":2,"index":7})", "Invalid mask value 4 at match mode"},
      {R"({"mode":4,"classMask":1,"level":2,"index":7})", "Invalid level value 2 at match mode"},
      {R"({"mode":4,"classMask":2,"level":-2})", "Invalid level value -2 at match mode"},
      {R"({"mode":2,"classMask":0,"level":2,"index":7})", "Invalid mode value 2"},
      {R"({"mode":0})", "Invalid mode value 0"},
      {R"({"mode":3,"classMask":1})", "Invalid mode value 3"},
      {R"({"mode":5,"classMask":1})", "Invalid mode value 5"},
      {R"({"mode":"4","classMask":1})", "Invalid mode value 0"},
  };
  for (const auto& [text, message] : rows) {
    OptionDTWGS option;
    EXPECT_EQ(option.parse(text), message == nullptr ? 0 : -1) << text;
    EXPECT_EQ(fake::platform().takeLog(),
              message == nullptr ? std::vector<fake::LogLine>{} : std::vector{errorLine(message)})
        << text;
  }
}

TEST_F(TemplateGestureOption, EnrollModeKeepsItsSettingsUnchecked) {
  const auto option = parsed<OptionDTWGS>(R"({"mode":1,"classMask":9,"level":-7,"index":1})");
  EXPECT_EQ(option.mode(), 1);
  EXPECT_EQ(option.classMask(), 9);
  EXPECT_EQ(option.level(), -7);
  EXPECT_EQ(option.index(), 1);
}

TEST_F(TemplateGestureOption, StringBringsInTemplates) {
  parsed<OptionDTWGS>(R"({"mode":1,"template1":"0003a1b2c3"})");
  EXPECT_EQ(templates.slots[0].templateLength, 3);
  EXPECT_EQ(head(templates.slots[0], 3), (std::vector<uint8_t>{0xa1, 0xb2, 0xc3}));
  EXPECT_TRUE(isEmpty(templates.slots[1]));

  parsed<OptionDTWGS>(R"({"template2":"0002a1b","mode":1})");
  EXPECT_EQ(templates.slots[0].templateLength, 3);
  EXPECT_EQ(templates.slots[1].templateLength, 2);
  EXPECT_EQ(head(templates.slots[1], 2), (std::vector<uint8_t>{0xa1, 0}));
}

TEST_F(TemplateGestureOption, TemplatesOfARefusedStringAreStoredAllTheSame) {
  OptionDTWGS option;
  EXPECT_EQ(option.parse(R"({"mode":2,"template1":"000111","template2":"000222"})"), -1);
  EXPECT_EQ(fake::platform().takeLog(), std::vector{errorLine("Invalid mode value 2")});
  EXPECT_EQ(templates.slots[0].templateLength, 1);
  EXPECT_EQ(templates.slots[0].templateData[0], 0x11);
  EXPECT_EQ(templates.slots[1].templateLength, 2);
  EXPECT_EQ(templates.slots[1].templateData[0], 0x22);
}

TEST_F(TemplateGestureOption, TextThatIsNoJsonBringsInNoTemplate) {
  OptionDTWGS option;
  EXPECT_EQ(option.parse(R"({"mode":1,"template1":"000111")"), -1);
  EXPECT_EQ(option.parse(nullptr), -1);
  EXPECT_TRUE(isEmpty(templates.slots[0]));
  EXPECT_TRUE(fake::platform().takeLog().empty());
}

TEST_F(TemplateGestureOption, TemplateThatIsNoStringCountsAsMissing) {
  for (const char* value : {"1", "null", "true", "2.0", "[\"000111\"]", "{}"}) {
    const std::string json(value);
    parsed<OptionDTWGS>("{\"mode\":1,\"template1\":" + json + ",\"template2\":" + json + "}");
    for (const auto& slot : templates.slots) EXPECT_TRUE(isEmpty(slot)) << value;
  }
  EXPECT_TRUE(fake::platform().takeLog().empty());
}

TEST_F(TemplateGestureOption, BadTemplateRefusesTheStringBeforeAnyOtherCheck) {
  struct Row {
    const char* text;
    std::vector<fake::LogLine> log;
    std::array<int32_t, 2> lengths;
  };
  const auto first = errorLine("Invalid template1 value");
  const auto second = errorLine("Invalid template2 value");
  const Row rows[] = {
      {R"({"mode":4,"classMask":1,"template1":""})", {first}, {0, 0}},
      {R"({"mode":4,"classMask":1,"template1":"000","template2":"0007"})", {first}, {0, 7}},
      {R"({"mode":4,"classMask":1,"template1":"0005","template2":"0385"})", {second}, {5, 0}},
      {R"({"mode":4,"classMask":1,"template2":"x","template1":"/001"})", {first, second}, {0, 0}},
      {R"({"mode":9,"template1":"1"})", {first}, {0, 0}},
      {R"({"mode":4,"classMask":0,"template2":"1"})", {second}, {0, 0}},
      {R"({"mode":4,"classMask":1,"level":2,"template2":"1"})", {second}, {0, 0}},
      {R"({"mode":1,"index":2,"template2":"1"})", {second}, {0, 0}},
  };
  for (const auto& [text, log, lengths] : rows) {
    templates = {};
    auto option = parsed<OptionDTWGS>(R"({"mode":1,"classMask":2,"level":1,"index":1})");
    EXPECT_EQ(option.parse(text), -1) << text;
    EXPECT_EQ(fake::platform().takeLog(), log) << text;
    EXPECT_EQ(templates.slots[0].templateLength, lengths[0]) << text;
    EXPECT_EQ(templates.slots[1].templateLength, lengths[1]) << text;
    EXPECT_EQ(option.mode(), 1) << text;
    EXPECT_EQ(option.classMask(), 2) << text;
    EXPECT_EQ(option.level(), 1) << text;
    EXPECT_EQ(option.index(), 1) << text;
  }
}

TEST_F(TemplateGestureOption, TemplateOfMoreThan900BytesIsRefusedByItsName) {
  OptionDTWGS option;
  const std::string text = R"({"mode":1,"template2":"0384)" + repeated("5c", 901) + "\"}";
  EXPECT_EQ(option.parse(text.c_str()), -1);
  EXPECT_EQ(fake::platform().takeLog(), std::vector{errorLine("Invalid template2 value")});
  EXPECT_TRUE(isEmpty(templates.slots[1]));
}

const char* const kEnroll = R"({"mode":1})";
const char* const kMatch = R"({"mode":4,"classMask":3})";

// Mode 2 comes from no string, but the merge rules and the list know it.
class InModeTwo : public OptionDTWGS {
 public:
  InModeTwo() { settings.mode = 2; }
};

// What a session's option and others' come to, as the sensor merges them: all into a copy of the first.
template <class Mine>
std::unique_ptr<Option> negotiated(const Mine& mine, const std::vector<const Option*>& others) {
  auto merged = mine.clone();
  merged->merge(mine);
  for (const Option* other : others) merged->merge(*other);
  return merged;
}

// A list is expected with this many entries, or this line instead.
void expectList(Option& option, std::optional<int32_t> count, const char* line = nullptr) {
  fake::platform().takeLog();
  const PropertyList list = listOf(option);
  EXPECT_EQ(list != nullptr ? std::optional(list->count) : std::nullopt, count);
  std::vector<fake::LogLine> log;
  if (line != nullptr) log.push_back({kDebug, "libsenseloom", line});
  EXPECT_EQ(fake::platform().takeLog(), log);
}

TEST_F(TemplateGestureOption, NewOptionHasNoModeToRender) {
  OptionDTWGS option;
  expectList(option, std::nullopt, "option mode incompatible: 0");
}

TEST_F(TemplateGestureOption, OneEnrollingSessionRendersAnEmptyList) {
  const auto enroll = parsed<OptionDTWGS>(kEnroll);
  expectList(*negotiated(enroll, {}), 0);
}

TEST_F(TemplateGestureOption, EnrollingListIsEmptyWhateverIsStored) {
  ASSERT_TRUE(templates.setTemplate(1, "000111"));
  auto enroll = parsed<OptionDTWGS>(R"({"mode":1,"classMask":3})");
  expectList(enroll, 0);
}

TEST_F(TemplateGestureOption, TwoEnrollingSessionsExcludeEachOther) {
  const auto enroll = parsed<OptionDTWGS>(kEnroll);
  expectList(*negotiated(enroll, {&enroll}), std::nullopt, "option invalid");
}

TEST_F(TemplateGestureOption, EnrollingAndMatchingSessionsAreIncompatible) {
  const auto enroll = parsed<OptionDTWGS>(kEnroll);
  const auto match = parsed<OptionDTWGS>(kMatch);
  expectList(*negotiated(enroll, {&match}), std::nullopt, "option mode incompatible: 5");
  expectList(*negotiated(match, {&enroll}), std::nullopt, "option mode incompatible: 5");
  expectList(*negotiated(match, {&enroll, &enroll}), std::nullopt, "option invalid");
}

TEST_F(TemplateGestureOption, MatchingSessionsAreAnyNumber) {
  const auto match = parsed<OptionDTWGS>(kMatch);
  expectList(*negotiated(match, {&match, &match}), 1);
}

TEST_F(TemplateGestureOption, SessionWithoutAModeChangesNothingInAMerge) {
  const auto enroll = parsed<OptionDTWGS>(kEnroll);
  const OptionDTWGS none;
  expectList(*negotiated(enroll, {&none, &none}), 0);
}

TEST_F(TemplateGestureOption, ModeTwoEnrollsToo) {
  InModeTwo two;
  expectList(two, 0);
  expectList(*negotiated(two, {}), 0);
}

TEST_F(TemplateGestureOption, TwoSessionsInModeTwoExcludeEachOther) {
  const InModeTwo two;
  expectList(*negotiated(two, {&two}), std::nullopt, "option invalid");
}

TEST_F(TemplateGestureOption, ModeTwoIsIncompatibleWithTheOthers) {
  const InModeTwo two;
  const auto enroll = parsed<OptionDTWGS>(kEnroll);
  const auto match = parsed<OptionDTWGS>(kMatch);
  expectList(*negotiated(two, {&enroll}), std::nullopt, "option mode incompatible: 3");
  expectList(*negotiated(two, {&match}), std::nullopt, "option mode incompatible: 6");
}

TEST_F(TemplateGestureOption, CountsTheEnrollingSessionsOfEachMerge) {
  auto enroll = parsed<OptionDTWGS>(kEnroll);
  enroll.merge(parsed<OptionDTWGS>(kEnroll));
  expectList(enroll, 0);

  EXPECT_EQ(enroll.parse(kEnroll), 0);  // starts the count over
  enroll.merge(parsed<OptionDTWGS>(kEnroll));
  expectList(enroll, 0);

  const auto copy = enroll.clone();  // ... and so does a copy
  copy->merge(enroll);
  expectList(*copy, 0);

  enroll.merge(parsed<OptionDTWGS>(kEnroll));
  expectList(enroll, std::nullopt, "option invalid");
}

TEST_F(TemplateGestureOption, CountsSessionsInModeTwoAnewAfterAString) {
  auto option = parsed<OptionDTWGS>(kMatch);
  option.merge(InModeTwo());
  EXPECT_EQ(option.parse(kMatch), 0);
  option.merge(InModeTwo());
  expectList(option, std::nullopt, "option mode incompatible: 6");
}

TEST_F(TemplateGestureOption, StringAndCopyAreFreeOfAConflict) {
  auto enroll = parsed<OptionDTWGS>(kEnroll);
  enroll.merge(parsed<OptionDTWGS>(kEnroll));
  enroll.merge(parsed<OptionDTWGS>(kEnroll));
  expectList(enroll, std::nullopt, "option invalid");
  expectList(*enroll.clone(), 0);
  EXPECT_EQ(enroll.parse("{"), -1);
  expectList(enroll, std::nullopt, "option invalid");
  EXPECT_EQ(enroll.parse(R"({"mode":9})"), -1);
  fake::platform().takeLog();
  expectList(enroll, std::nullopt, "option invalid");
  EXPECT_EQ(enroll.parse(kEnroll), 0);
  expectList(enroll, 0);
}

TEST_F(TemplateGestureOption, CopyDoesNotCarryTheIndex) {
  const auto enroll = parsed<OptionDTWGS>(R"({"mode":1,"index":1})");
  const auto copy = negotiated(enroll, {});
  EXPECT_EQ(static_cast<const OptionDTWGS&>(*copy).index(), 0);
  EXPECT_EQ(enroll.index(), 1);
}

// An entry of a list with the bytes of its value.
struct Entry {
  int32_t id;
  int32_t size;
  std::vector<uint8_t> bytes;
  bool operator==(const Entry&) const = default;
};
void PrintTo(const Entry& entry, std::ostream* out) {
  *out << "id " << entry.id << " size " << entry.size << " bytes " << testing::PrintToString(entry.bytes);
}

std::vector<Entry> allEntriesOf(const PropertyList& list) {
  std::vector<Entry> entries;
  for (int i = 0; i < list->count; ++i) {
    const ctx_property_t& entry = list->properties[i];
    const auto* bytes = static_cast<const uint8_t*>(entry.value);
    entries.push_back({entry.id, entry.size, {bytes, bytes + entry.size}});
  }
  return entries;
}

const Entry kLevel{121, 4, {0xff, 0xff, 0xff, 0xff}};  // -1
const Entry kNumber0{122, 4, {0, 0, 0, 0}};
const Entry kNumber1{122, 4, {1, 0, 0, 0}};
const Entry kData0{123, 3, {0xa1, 0xb2, 0xc3}};
const Entry kData1{123, 1, {0xd4}};

TEST_F(TemplateGestureOption, MatchingListHoldsTheWantedTemplatesThatAreStored) {
  struct Row {
    const char* first;   // template; null: none
    const char* second;  // template; null: none
    int32_t mask;
    std::vector<Entry> entries;
  };
  const char* one = "0003a1b2c3";
  const char* two = "0001d4";
  const Row rows[] = {
      {nullptr, nullptr, 3, {kLevel}},
      {"0000a1", "0000", 3, {kLevel}},  // a length of 0 is no template
      {one, nullptr, 3, {kLevel, kNumber0, kData0}},
      {nullptr, two, 3, {kLevel, kNumber1, kData1}},
      {one, two, 3, {kLevel, kNumber0, kData0, kNumber1, kData1}},
      {one, two, 1, {kLevel, kNumber0, kData0}},
      {one, two, 2, {kLevel, kNumber1, kData1}},
      {nullptr, two, 1, {kLevel}},
      {one, nullptr, 2, {kLevel}},
  };
  for (const auto& [first, second, mask, entries] : rows) {
    templates = {};
    if (first != nullptr) templates.setTemplate(1, first);
    if (second != nullptr) templates.setTemplate(2, second);
    auto option = parsed<OptionDTWGS>("{\"mode\":4,\"level\":-1,\"classMask\":" + std::to_string(mask) + "}");
    EXPECT_EQ(allEntriesOf(listOf(option)), entries) << "mask " << mask;
  }
}

TEST_F(TemplateGestureOption, MergedMaskAndLevelDecideTheMatchingList) {
  ASSERT_TRUE(templates.setTemplate(1, "0003a1b2c3"));
  ASSERT_TRUE(templates.setTemplate(2, "0001d4"));
  const auto mine = parsed<OptionDTWGS>(R"({"mode":4,"classMask":1,"level":1})");
  const auto other = parsed<OptionDTWGS>(R"({"mode":4,"classMask":2,"level":-1})");
  EXPECT_EQ(allEntriesOf(listOf(*negotiated(mine, {&other}))),
            (std::vector<Entry>{kLevel, kNumber0, kData0, kNumber1, kData1}));
}

TEST_F(TemplateGestureOption, TemplatesOfAListAreTheStoredOnesThemselves) {
  auto option = parsed<OptionDTWGS>(R"({"mode":4,"classMask":3,"template1":"0001aa","template2":"0001bb"})");
  const PropertyList list = listOf(option);
  ASSERT_EQ(list->count, 5);
  EXPECT_EQ(list->properties[2].value, templates.slots[0].templateData.data());
  EXPECT_EQ(list->properties[4].value, templates.slots[1].templateData.data());

  parsed<OptionDTWGS>(R"({"mode":1,"template1":"0002cc"})");
  EXPECT_EQ(*static_cast<const uint8_t*>(list->properties[2].value), 0xcc);
  EXPECT_EQ(list->properties[2].size, 1);
}

TEST_F(TemplateGestureOption, NextStringZeroesTheNumbersOfAListToo) {
  auto option = parsed<OptionDTWGS>(R"({"mode":4,"classMask":2,"level":1,"template2":"0001bb"})");
  const PropertyList list = listOf(option);
  ASSERT_EQ(list->count, 3);
  EXPECT_EQ(intAt(list->properties[0]), 1);
  EXPECT_EQ(intAt(list->properties[1]), 1);
  EXPECT_EQ(option.parse(R"({"mode":4,"classMask":2,"level":1})"), 0);
  EXPECT_EQ(intAt(list->properties[0]), 0);
  EXPECT_EQ(intAt(list->properties[1]), 0);
  EXPECT_EQ(*static_cast<const uint8_t*>(list->properties[2].value), 0xbb);
}

}  // namespace
}  // namespace senseloom
