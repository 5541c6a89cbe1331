#include "option/option_class_masks.h"

#include <gtest/gtest.h>

#include <vector>

#include "option_test_support.h"

namespace senseloom {
namespace {

using FlickGestureOption = OptionTest;
using InstantActivityOption = OptionTest;
using HandDrawnGestureOption = OptionTest;
using LiftOption = OptionTest;

TEST_F(FlickGestureOption, BadLevelBecomesZeroAndKeepsTheMask) {
  const auto option = parsed<OptionGestureFlick>(R"({"classMask":5,"level":-6})");
  EXPECT_EQ(option.classMask(), 5);
  EXPECT_EQ(option.level(), 0);
  EXPECT_EQ(fake::platform().takeLog(), std::vector{errorLine("gestureflick: invalid level value -6")});
}

TEST_F(FlickGestureOption, BadMaskAndBadLevelAreLoggedInThisOrder) {
  const auto option = parsed<OptionGestureFlick>(R"({"level":6,"classMask":64})");
  EXPECT_EQ(option.classMask(), 63);
  EXPECT_EQ(option.level(), 0);
  EXPECT_EQ(fake::platform().takeLog(), (std::vector{errorLine("gestureflick: invalid clsmask value 64"),
                                                     errorLine("gestureflick: invalid level value 6")}));
}

TEST_F(InstantActivityOption, AcceptsATextThatIsNoJsonAndANullOne) {
  OptionInstantActivity option;
  EXPECT_EQ(option.parse(nullptr), 0);
  EXPECT_EQ(option.classMask(), 15);
  EXPECT_EQ(option.parse(R"({"classMask":6})"), 0);
  EXPECT_EQ(option.parse("5 %d"), 0);
  EXPECT_EQ(option.parse(nullptr), 0);
  EXPECT_EQ(option.classMask(), 6);
  EXPECT_EQ(fake::platform().takeLog(),
            (std::vector<fake::LogLine>{
                {kError, "STY", "instantactivity: invalid opton string (null), all set as default"},
                {kError, "STY", "instantactivity: invalid opton string 5 %d, all set as default"},
                {kError, "STY", "instantactivity: invalid opton string (null), all set as default"}}));
}

TEST_F(HandDrawnGestureOption, RendersAnEmptyListWhateverTheMask) {
  OptionGestureHMM option;
  for (const char* text : {"{}", R"({"classMask":1})", R"({"classMask":0})"}) {
    EXPECT_EQ(option.parse(text), 0);
    const PropertyList list = listOf(option);
    ASSERT_NE(list, nullptr) << text;
    EXPECT_EQ(list->count, 0) << text;
  }
}

TEST_F(LiftOption, LogsEveryStringAndKeepsItsMask) {
  OptionLift option;
  for (const char* text : {R"({"classMask":1})", R"({"classMask":3})", "{}", R"({"classMask":"1"})"}) {
    EXPECT_EQ(option.parse(text), 0);
    EXPECT_EQ(option.classMask(), 3) << text;
  }
  EXPECT_EQ(option.parse("{"), -1);
  EXPECT_EQ(
      fake::platform().takeLog(),
      (std::vector{errorLine("tapping: invalid clsmask value 1"), errorLine("tapping: invalid clsmask value 3"),
                   errorLine("tapping: invalid clsmask value 3"), errorLine("tapping: invalid clsmask value 3")}));
}

}  // namespace
}  // namespace senseloom
