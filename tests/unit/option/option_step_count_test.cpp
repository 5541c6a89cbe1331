#include "option/option_step_count.h"

#include <gtest/gtest.h>

#include <vector>

#include "option_test_support.h"

namespace senseloom {
namespace {

using StepCountOption = OptionTest;

TEST_F(StepCountOption, LogNIsACountAndNoLogarithm) {
  auto option = parsed<OptionStepCount>(R"({"mode":0,"logN":100})");
  option.merge(parsed<OptionStepCount>(R"({"mode":1,"logN":99})"));
  EXPECT_EQ(entriesOf(listOf(option)), (std::vector<Property>{{141, 4, 0}, {142, 4, 99}}));
}

TEST_F(StepCountOption, CorrectsValuesSilently) {
  const auto option = parsed<OptionStepCount>(R"({"mode":2,"logN":101})");
  EXPECT_EQ(option.mode(), 1);
  EXPECT_EQ(option.logN(), 100);
  EXPECT_TRUE(fake::platform().takeLog().empty());
}

}  // namespace
}  // namespace senseloom
