#include <gtest/gtest.h>

#include <string>

#include "run_tool.h"

namespace senseloom::tool {
namespace {

TEST(Sensors, PrintsOneSensor) {
  const ToolRun run = runTool({"sensors", "STAP"});
  EXPECT_EQ(run.out,
            "STAP: tapping\n"
            "  key        default  range  out of range  merged to   note\n"
            "  classMask  3        1..3   becomes 3     bitwise or\n"
            "  level      0        -5..5  see note      minimum     a level out of range sets \"classMask\" to 0\n"
            "  properties: 101 classMask, 102 level\n");
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
  EXPECT_NE(runTool({"sensors", "GSPX"}).out.find("  properties: none\n"), std::string::npos);
  EXPECT_NE(runTool({"sensors", "DTWGS"}).out.find("  template2           string"), std::string::npos);
}

TEST(Sensors, PrintsJson) {
  EXPECT_EQ(
      runTool({"sensors", "--json", "STAP"}).out,
      R"({"sensor":"STAP","title":"tapping","keys":[)"
      R"({"name":"classMask","default":3,"range":[1,3],"outOfRange":"becomes 3","merged":"bitwise or","note":""},)"
      R"({"name":"level","default":0,"range":[-5,5],"outOfRange":"see note","merged":"minimum",)"
      R"("note":"a level out of range sets \"classMask\" to 0"}],"stringKeys":[],)"
      R"("properties":[{"id":101,"name":"classMask"},{"id":102,"name":"level"}],"note":""})"
      "\n");
  EXPECT_NE(runTool({"sensors", "--json", "LIFT"}).out.find(R"("range":[])"), std::string::npos);
  EXPECT_NE(runTool({"sensors", "--json", "DTWGS"}).out.find(R"("stringKeys":["template1","template2"])"),
            std::string::npos);
}

TEST(Sensors, RefusesAnUnknownSensor) {
  const ToolRun run = runTool({"sensors", "stap"});
  EXPECT_EQ(run.err, "senseloom: unknown sensor \"stap\": `senseloom sensors` prints those that are known\n");
  EXPECT_EQ(run.out, "");
  EXPECT_EQ(run.status, 2);
}

}  // namespace
}  // namespace senseloom::tool
