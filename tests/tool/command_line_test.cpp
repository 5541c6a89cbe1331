#include <gtest/gtest.h>

#include <cstdlib>
#include <string>

#include "run_tool.h"

namespace senseloom::tool {
namespace {

TEST(CommandLine, PrintsTheVersion) {
  const ToolRun run = runTool({"--version"});
  EXPECT_EQ(run.out, "senseloom " SENSELOOM_VERSION "\n");
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.status, 0);
}

TEST(CommandLine, HelpsWithEveryCommand) {
  EXPECT_NE(runTool({"--help"}).out.find("replay"), std::string::npos);
  EXPECT_NE(runTool({"replay", "--help"}).out.find("--quiet"), std::string::npos);
  EXPECT_NE(runTool({"record", "--help"}).out.find("-o,--output"), std::string::npos);
  EXPECT_NE(runTool({"generate", "--help"}).out.find("commute"), std::string::npos);
  EXPECT_NE(runTool({"generate", "commute", "--help"}).out.find("--seed"), std::string::npos);
  EXPECT_NE(runTool({"sensors", "--help"}).out.find("SENSOR"), std::string::npos);
  EXPECT_EQ(runTool({"replay", "--help"}).status, 0);
}

TEST(CommandLine, RefusesWhatItDoesNotUnderstandWithStatus2) {
  const std::vector<std::vector<std::string>> lines = {
      {},
      {"relay"},
      {"replay"},
      {"replay", "a", "b"},
      {"replay", "--jsn", "lift.jsonl"},
      {"replay", "--json", "--quiet", "lift.jsonl"},
      {"replay", "--all", "--quiet", "lift.jsonl"},
      {"replay", "--all", "--json", "lift.jsonl"},
      {"replay", "--check", "--all", "lift.jsonl"},
      {"replay", "--check", "--json", "lift.jsonl"},
      {"replay", "--check", "--quiet", "lift.jsonl"},
      {"replay", "--log", "loud", "lift.jsonl"},
      {"record"},
      {"record", "--"},
      {"generate"},
      {"generate", "commute"},
      {"generate", "commute", "--seed", "-1"},
      {"generate", "commute", "--seed", "one"},
      {"generate", "commute", "--seed", "1", "--records", "-1"},
      {"sensors", "STAP", "LIFT"},
  };
  for (const auto& line : lines) {
    const ToolRun run = runTool(line);
    EXPECT_EQ(run.out, "");
    EXPECT_NE(run.err, "");
    EXPECT_EQ(run.status, 2) << testing::PrintToString(line);
  }
}

TEST(CommandLine, ReportsOutputThatCanNotBeWrittenWithStatus1) {
  EXPECT_EQ(std::system("exec 2>/dev/null >/dev/full; '" TOOL_FILE "' sensors"), 1 << 8);
  EXPECT_EQ(std::system("exec 2>/dev/null >&-; '" TOOL_FILE "' sensors"), 1 << 8);
}

TEST(GenerateCommute, WritesTheExampleFromSeed1) {
  const ToolRun run = runTool({"generate", "commute", "--seed", "1"});
  EXPECT_TRUE(run.out == contentOf(EXAMPLES_FOLDER "/commute.jsonl"));
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.status, 0);
}

TEST(GenerateCommute, WritesAsManyRecordsAsAskedFor) {
  const ToolRun run = runTool({"generate", "commute", "--seed", "18446744073709551615", "--records", "1"});
  EXPECT_EQ(run.status, 0);
  const std::string replayed = runTool({"replay", "--quiet", "-"}, run.out).out;
  // The one record comes at the end of the day, when "fitness" is left.
  EXPECT_EQ(replayed,
            "session  sensor    opened   records   results    failed\n"
            "logger   PHYAC          1         0         0         0\n"
            "nav      PHYAC          2         0         0         0\n"
            "fitness  PHYAC          1         1         0         0\n");
}

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
  for (const char* sensor :
       {"PHYAC", "STAP", "GSFLK", "SHAKI", "ISACT", "SCOUN", "GSPX", "DTWGS", "GSETH", "LPE_P", "PDR", "LIFT"}) {
    const std::string block = runTool({"sensors", sensor}).out;
    EXPECT_EQ(block.rfind(std::string(sensor) + ": ", 0), 0U);
    EXPECT_EQ(out.substr(position, block.size()), block);
    position += block.size() + 1;  // a blank line between two
  }
  EXPECT_EQ(position, out.size() + 1);
}

TEST(Sensors, TellsEveryKindOfRangeAndOfMerging) {
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
