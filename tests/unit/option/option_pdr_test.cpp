#include "option/option_pdr.h"

#include <gtest/gtest.h>

#include <vector>

#include "option_test_support.h"

namespace senseloom {
namespace {

using PdrOption = OptionTest;

TEST_F(PdrOption, LogsTheDefaultOfEachMissingKeyOnEveryString) {
  struct Row {
    const char* text;
    std::vector<fake::LogLine> log;
  };
  const Row rows[] = {
      {R"({"floorHeight":300,"6DOF":0})", {errorLine("PDR: invalid user height value 1000")}},
      {R"({"userHeight":170,"6DOF":0})", {errorLine("PDR: invalid floor height value 5000")}},
      {R"({"userHeight":170,"floorHeight":300})", {errorLine("PDR: invalid 6DOF value 2")}},
  };
  for (const auto& [text, log] : rows) {
    OptionPDR option;
    for (int time = 1; time <= 2; ++time) {
      EXPECT_EQ(option.parse(text), 0);
      EXPECT_EQ(fake::platform().takeLog(), log) << text << " time " << time;
    }
  }
}

TEST_F(PdrOption, LogsAllBadValuesInTheOrderOfTheKeys) {
  auto option = parsed<OptionPDR>(R"({"6DOF":-1,"N":7,"initX":-8,"floorHeight":199,"userHeight":301})");
  EXPECT_EQ(
      fake::platform().takeLog(),
      (std::vector{errorLine("PDR: invalid user height value 301"), errorLine("PDR: invalid floor height value 199"),
                   errorLine("PDR: invalid N value 7"), errorLine("PDR: invalid 6DOF value -1")}));
  EXPECT_EQ(
      entriesOf(listOf(option)),
      (std::vector<Property>{
          {181, 4, 1000}, {182, 4, 5000}, {183, 4, -8}, {184, 4, 32767}, {185, 4, 32767}, {186, 4, 0}, {187, 4, 2}}));
}

}  // namespace
}  // namespace senseloom
