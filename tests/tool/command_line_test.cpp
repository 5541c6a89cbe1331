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
      {"status"},
      {"status", "self"},
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

TEST(CommandLine, ReportsOutputThatCannotBeWrittenWithStatus1) {
  EXPECT_EQ(std::system("exec 2>/dev/null >/dev/full; '" TOOL_FILE "' sensors"), 1 << 8);
  EXPECT_EQ(std::system("exec 2>/dev/null >&-; '" TOOL_FILE "' sensors"), 1 << 8);
}

}  // namespace
}  // namespace senseloom::tool
