#include <gtest/gtest.h>

#include <string>

#include "run_tool.h"

namespace senseloom::tool {
namespace {

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

}  // namespace
}  // namespace senseloom::tool
