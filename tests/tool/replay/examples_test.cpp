#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "run_tool.h"

namespace senseloom::tool {
namespace {

// The whole output for an example, as it was checked by hand. NAME.txt is what `replay --all` prints, NAME.json what
// `replay --json` does.
class Example : public testing::TestWithParam<std::string> {
 protected:
  static void expectGolden(const char* form, const std::string& golden) {
    const ToolRun run =
        runTool({"replay", form, GetParam() + ".jsonl"}, "", {{"SENSELOOM_GESTURE_SCRIPT", "gesture_hmm.script"}});
    EXPECT_EQ(run.out, contentOf(std::string(GOLDEN_FOLDER "/") + GetParam() + golden));
    EXPECT_EQ(run.status, 0);
  }
};

TEST_P(Example, IsReplayedAsATable) {
  expectGolden("--all", ".txt");
}

TEST_P(Example, IsReplayedAsJson) {
  expectGolden("--json", ".json");
}

// The commute has a golden file of its own, below.
std::vector<std::string> shortExamples() {
  std::vector<std::string> names = exampleNames();
  std::erase(names, "commute");
  return names;
}

INSTANTIATE_TEST_SUITE_P(All, Example, testing::ValuesIn(shortExamples()),
                         [](const auto& example) { return example.param; });

// The table of the commute agrees with one that was computed by other means.
TEST(CommuteExample, IsReplayedAsATable) {
  const ToolRun run = runTool({"replay", "commute.jsonl"});
  EXPECT_EQ(run.out, contentOf(GOLDEN_FOLDER "/commute.txt"));
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.status, 0);
}

TEST(CommuteExample, IsReplayedAsASummary) {
  EXPECT_EQ(runTool({"replay", "--quiet", "commute.jsonl"}).out,
            "session  sensor    opened   records   results    failed\n"
            "logger   PHYAC          1      2196        38         0\n"
            "nav      PHYAC          2      1428        39         0\n"
            "fitness  PHYAC          1      2004        39         0\n");
}

TEST(GestureExample, RecognisesNothingWithoutItsScript) {
  const ToolRun run = runTool({"replay", "--quiet", "gesture_hmm.jsonl"});
  EXPECT_EQ(run.out,
            "session  sensor    opened   records   results    failed\n"
            "dialer   GSPX           1         8         0         1\n"
            "notes    GSPX           1         7         0         0\n");
}

TEST(AudioExample, SwitchesTheAudioHardwareOnAndOff) {
  const ToolRun run = runTool({"replay", "--log", "debug", "audio_classification.jsonl"});
  // Twice: with the last session, and at the end of the trace.
  const std::string message = "deactivating aware session...\n";
  const size_t first = run.err.find(message);
  ASSERT_NE(first, std::string::npos);
  const size_t second = run.err.find(message, first + 1);
  ASSERT_NE(second, std::string::npos);
  EXPECT_EQ(run.err.find(message, second + 1), std::string::npos);
  EXPECT_LT(run.err.find("activated aware successful..."), first);
}

}  // namespace
}  // namespace senseloom::tool
