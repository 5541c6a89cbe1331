#include <gtest/gtest.h>

#include <string>

#include "run_tool.h"

namespace senseloom::tool {
namespace {

TEST(Sensors, PrintsOneSensor) {
  const ToolRun run = runTool({"sensors", "STAP"});
  EXPECT_EQ(
      run.out,
      "STAP: tapping\n"
      "  key        default  range  out of range  merged to   means\n"
      "  classMask  3        1..3   becomes 3     bitwise or  the taps wanted, as a set of bits; what a bit stands "
      "for is defined by whoever makes the records\n"
      "  level      0        -5..5  see note      minimum     the sensitivity of the sensor; its steps are defined "
      "by whoever makes the records\n"
      "  note on level: a level out of range sets \"classMask\" to 0\n"
      "  property       means\n"
      "  101 classMask  \"classMask\", merged\n"
      "  102 level      \"level\", merged\n"
      "  field      means\n"
      "  timestamp  any number, such as a time in any unit: it is copied or compared, and never interpreted\n"
      "  classes    a set of bits; what a bit stands for is defined by whoever makes the records\n");
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.status, 0);
}

TEST(Sensors, PrintsAllInTheirOrder) {
  const std::string out = runTool({"sensors"}).out;
  size_t position = 0;
  for (const std::string& sensor : sensorNames()) {
    const std::string block = runTool({"sensors", sensor}).out;
    EXPECT_EQ(block.rfind(sensor + ": ", 0), 0U);
    EXPECT_EQ(out.substr(position, block.size()), block);
    position += block.size() + 1;  // a blank line between two
  }
  EXPECT_EQ(position, out.size() + 1);
}

TEST(Sensors, PrintsEveryKindOfRangeAndOfMerging) {
  const std::string activity = runTool({"sensors", "PHYAC"}).out;
  EXPECT_NE(activity.find("  logN        0        0..8     nearest bound  minimum"), std::string::npos) << activity;
  EXPECT_NE(activity.find("  weightVar   -1       0..      becomes -1     the one that started the merge"),
            std::string::npos)
      << activity;
  EXPECT_NE(activity.find("  continuous  0        0..1     becomes 1      1 when any is not 0"), std::string::npos);
  EXPECT_NE(activity.find("1 when all are 1"), std::string::npos);
  EXPECT_NE(runTool({"sensors", "SHAKI"}).out.find("maximum"), std::string::npos);
  EXPECT_NE(runTool({"sensors", "LPE_P"}).out.find("any                  the last one opened"), std::string::npos);
  EXPECT_NE(runTool({"sensors", "LIFT"}).out.find("none   becomes 3"), std::string::npos);
  EXPECT_NE(runTool({"sensors", "GSPX"}).out.find("  property  means\n  none\n"), std::string::npos);
  EXPECT_NE(runTool({"sensors", "DTWGS"}).out.find("  template2           string"), std::string::npos);
}

TEST(Sensors, SaysWhatKeysPropertiesAndFieldsMean) {
  const auto expectSaid = [](const char* sensor, const char* said) {
    const std::string out = runTool({"sensors", sensor}).out;
    EXPECT_NE(out.find(said), std::string::npos) << out;
  };
  expectSaid("PHYAC", "N = 2^logN decisions are weighed for a result\n");
  expectSaid("PHYAC", "the sensor decides anew each 2^logM; a client's batch is 2^(logN - merged logM)\n");
  expectSaid("PHYAC", "1 when any is not 0             no effect: ");
  expectSaid("PHYAC", "  43 spans             2^logN: in the high 16 bits for the largest ");
  expectSaid("DTWGS",
             "  template1           string                                                a template: four digits of ");
  expectSaid("GSPX", "  class      1 to 9 are these digits, ");
  expectSaid("PDR",
             "  items      28 bytes each, which are copied as they are; what they hold is defined by whoever makes ");
}

TEST(Sensors, PrintsJson) {
  EXPECT_EQ(
      runTool({"sensors", "--json", "STAP"}).out,
      R"({"sensor":"STAP","title":"tapping","keys":[)"
      R"({"name":"classMask","default":3,"range":[1,3],"outOfRange":"becomes 3","merged":"bitwise or",)"
      R"("means":"the taps wanted, as a set of bits; what a bit stands for is defined by whoever makes the records",)"
      R"("note":""},)"
      R"({"name":"level","default":0,"range":[-5,5],"outOfRange":"see note","merged":"minimum",)"
      R"("means":"the sensitivity of the sensor; its steps are defined by whoever makes the records",)"
      R"("note":"a level out of range sets \"classMask\" to 0"}],"stringKeys":[],)"
      R"("properties":[{"id":101,"name":"classMask","means":"\"classMask\", merged"},)"
      R"({"id":102,"name":"level","means":"\"level\", merged"}],)"
      R"("fields":[{"name":"timestamp",)"
      R"("means":"any number, such as a time in any unit: it is copied or compared, and never interpreted"},)"
      R"({"name":"classes",)"
      R"("means":"a set of bits; what a bit stands for is defined by whoever makes the records"}],"note":""})"
      "\n");
  EXPECT_NE(runTool({"sensors", "--json", "LIFT"}).out.find(R"("range":[])"), std::string::npos);
  EXPECT_NE(runTool({"sensors", "--json", "DTWGS"}).out.find(R"("stringKeys":[{"name":"template1","means":")"),
            std::string::npos);
}

TEST(Sensors, RefusesAnUnknownSensor) {
  const ToolRun run = runTool({"sensors", "stap"});
  EXPECT_EQ(run.err, "senseloom: unknown sensor \"stap\": the nearest is \"STAP\"; `senseloom sensors` prints all\n");
  EXPECT_EQ(run.out, "");
  EXPECT_EQ(run.status, 2);
}

}  // namespace
}  // namespace senseloom::tool
