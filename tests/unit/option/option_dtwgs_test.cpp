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

class GestureTemplate : public testing::Test {
 protected:
  ~GestureTemplate() override { templates = {}; }

  Templates& templates = OptionDTWGS::tempInst;
};

// Callers that know of the store read it by these offsets.
static_assert(offsetof(Templates::Slot, templateData) == 0 && offsetof(Templates::Slot, templateLength) == 900);
static_assert(sizeof(Templates::Slot) == 904 && sizeof(Templates) == 2 * 904);

TEST_F(GestureTemplate, AnyNumberButOneStandsForTheSecondSlot) {
  for (const int which : {2, 0, -1, 3, 257}) {
    templates = {};
    EXPECT_TRUE(templates.setTemplate(which, "0001ff"));
    EXPECT_EQ(templates.slots[1].templateLength, 1) << which;
    EXPECT_EQ(templates.slots[1].templateData[0], 0xff) << which;
    EXPECT_TRUE(isEmpty(templates.slots[0])) << which;
  }
}

TEST_F(GestureTemplate, NullLeavesTheSlotsAsTheyAre) {
  ASSERT_TRUE(templates.setTemplate(1, "0002a1b2"));
  for (const int which : {1, 2}) EXPECT_FALSE(templates.setTemplate(which, nullptr));
  EXPECT_EQ(templates.slots[0].templateLength, 2);
  EXPECT_TRUE(isEmpty(templates.slots[1]));
}

// Mode 2 comes from no string, but the merge rules and the list know it.
class InMode : public OptionDTWGS {
 public:
  explicit InMode(int32_t mode) { settings.mode = mode; }
};

// The number of entries of the option's list, or the log line instead.
std::string outcomeOf(Option& option) {
  ctx_option_t* list = nullptr;
  option.setProperty(&list);
  const auto log = fake::platform().takeLog();
  std::string outcome = list != nullptr ? std::to_string(list->count) : "";
  if (!log.empty()) outcome += log[0].tag + ' ' + std::to_string(log[0].priority) + ' ' + log[0].text;
  ctx_option_release(list);
  return outcome;
}

// What the options of several sessions come to, as the sensor merges them: all into a copy of the first.
std::string negotiated(const std::vector<int32_t>& modes) {
  const auto merged = InMode(modes.front()).clone();
  for (const int32_t mode : modes) merged->merge(InMode(mode));
  return outcomeOf(*merged);
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
  for (const auto& [mode, outcome] : {std::pair(1, "0"), std::pair(2, "libsenseloom 3 option mode incompatible: 3")}) {
    InMode option(mode);
    for (int sessions = 0; sessions < 2; ++sessions) option.merge(InMode(mode));
    EXPECT_EQ(outcomeOf(option), "libsenseloom 3 option invalid");
    EXPECT_EQ(option.parse(R"({"mode":1})"), 0);
    EXPECT_EQ(outcomeOf(option), "0");
    option.merge(InMode(mode));
    EXPECT_EQ(outcomeOf(option), outcome);
  }
}

TEST_F(GestureTemplate, StringSetsTheValuesThatAListPointsAtToZero) {
  OptionDTWGS option;
  ASSERT_EQ(option.parse(R"({"mode":4,"classMask":2,"level":1,"template2":"0001ff"})"), 0);
  ctx_option_t* list = nullptr;
  option.setProperty(&list);
  ASSERT_EQ(list->count, 3);
  const auto at = [&](int entry) { return *static_cast<const int32_t*>(list->properties[entry].value); };
  EXPECT_EQ(at(0), 1) << "level";
  EXPECT_EQ(at(1), 1) << "number of the template";
  EXPECT_EQ(option.parse(R"({"mode":4,"classMask":2,"level":1})"), 0);
  EXPECT_EQ(at(0), 0);
  EXPECT_EQ(at(1), 0);
  ctx_option_release(list);
}

TEST(TemplateGestureOption, ListIsStoredNowhereWithoutAPlace) {
  InMode(1).setProperty(nullptr);
  EXPECT_TRUE(fake::platform().takeLog().empty());
}

}  // namespace
}  // namespace senseloom
