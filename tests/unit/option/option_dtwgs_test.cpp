#include "option/option_dtwgs.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "fake_platform.h"

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

class GestureTemplate : public testing::Test {
 protected:
  ~GestureTemplate() override { templates = {}; }

  Templates& templates = OptionDTWGS::tempInst;
};

// Callers that know of the store read it by these offsets.
static_assert(offsetof(Templates::Slot, templateData) == 0 && offsetof(Templates::Slot, templateLength) == 900);
static_assert(sizeof(Templates::Slot) == 904 && sizeof(Templates) == 2 * 904);

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

// Mode 2 comes from no string, but the merge rules and the list know it.
class InMode : public OptionDTWGS {
 public:
  explicit InMode(int32_t mode) { settings.mode = mode; }
};

// What the options of several sessions come to, as the sensor merges them: all into a copy of the first. The number of
// entries of the list, or the log line instead.
std::string negotiated(const std::vector<int32_t>& modes) {
  const auto merged = InMode(modes.front()).clone();
  for (const int32_t mode : modes) merged->merge(InMode(mode));
  ctx_option_t* list = nullptr;
  merged->setProperty(&list);
  const auto log = fake::platform().takeLog();
  std::string outcome = list != nullptr ? std::to_string(list->count) : "";
  if (!log.empty()) outcome += log[0].tag + ' ' + std::to_string(log[0].priority) + ' ' + log[0].text;
  ctx_option_release(list);
  return outcome;
}

TEST(TemplateGestureOption, ModeTwoEnrollsToo) {
  EXPECT_EQ(negotiated({2}), "0");
  EXPECT_EQ(negotiated({2, 0}), "0") << "a session without a mode changes nothing";
}

TEST(TemplateGestureOption, SessionsInModeTwoExcludeEachOtherAndTheOtherModes) {
  EXPECT_EQ(negotiated({2, 2}), "libsenseloom 3 option invalid");
  EXPECT_EQ(negotiated({2, 1}), "libsenseloom 3 option mode incompatible: 3");
  EXPECT_EQ(negotiated({2, 4}), "libsenseloom 3 option mode incompatible: 6");
}

TEST(TemplateGestureOption, StringEndsAConflictAndCountsAnew) {
  InMode option(1);
  option.merge(InMode(1));
  option.merge(InMode(1));
  ctx_option_t* list = nullptr;
  option.setProperty(&list);
  EXPECT_EQ(list, nullptr);
  for (const int32_t mode : {1, 2}) {
    EXPECT_EQ(option.parse(R"({"mode":1})"), 0);
    option.merge(InMode(mode));
  }
  option.merge(InMode(0));
  option.setProperty(&list);
  EXPECT_EQ(list, nullptr) << "modes 1 and 2 together";
  EXPECT_EQ(option.parse(R"({"mode":1})"), 0);
  option.setProperty(&list);
  EXPECT_NE(list, nullptr);
  ctx_option_release(list);
}

TEST(TemplateGestureOption, ListIsStoredNowhereWithoutAPlace) {
  InMode(1).setProperty(nullptr);
  EXPECT_TRUE(fake::platform().takeLog().empty());
}

}  // namespace
}  // namespace senseloom
