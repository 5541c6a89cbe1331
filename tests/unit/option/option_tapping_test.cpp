#include "option/option_tapping.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "option_test_support.h"

namespace senseloom {
namespace {

using TappingOption = OptionTest;

TEST_F(TappingOption, BadLevelClearsMaskAndKeepsLevel) {
  auto option = parsed<OptionTapping>(R"({"classMask":2,"level":6})");
  EXPECT_EQ(option.classMask(), 0);
  EXPECT_EQ(option.level(), 6);
  EXPECT_EQ(fake::platform().takeLog(), std::vector{errorLine("tapping: invalid level value 6")});
  EXPECT_EQ(entriesOf(listOf(option)), (std::vector<Property>{{101, 4, 0}, {102, 4, 6}}));
}

TEST_F(TappingOption, BadLevelClearsTheDefaultMaskToo) {
  const auto option = parsed<OptionTapping>(R"({"level":-6})");
  EXPECT_EQ(option.classMask(), 0);
  EXPECT_EQ(option.level(), -6);
}

TEST_F(TappingOption, BadMaskAndBadLevelAreBothLoggedAndClearTheMask) {
  const auto option = parsed<OptionTapping>(R"({"level":-6,"classMask":4})");
  EXPECT_EQ(option.classMask(), 0);
  EXPECT_EQ(option.level(), -6);
  EXPECT_EQ(fake::platform().takeLog(),
            (std::vector{errorLine("tapping: invalid clsmask value 4"), errorLine("tapping: invalid level value -6")}));
}

TEST_F(TappingOption, GoodLevelAfterABadOneBringsTheMaskBack) {
  auto option = parsed<OptionTapping>(R"({"classMask":1,"level":6})");
  EXPECT_EQ(option.parse(R"({"classMask":1,"level":5})"), 0);
  EXPECT_EQ(option.classMask(), 1);
  EXPECT_EQ(option.level(), 5);
}

}  // namespace
}  // namespace senseloom
