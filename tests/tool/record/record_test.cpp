#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <string>

#include "recording.h"

namespace senseloom::tool {
namespace {

class RecordedExample : public testing::TestWithParam<std::string> {};

TEST_P(RecordedExample, IsReplayedAsRecorded) {
  const ScratchFile trace(GetParam());
  const std::string example = GetParam() + ".jsonl";
  const ToolRun recorded = recordTo(trace.name, {TOOL_FILE, "replay", "--log", "none", "--all", example});
  EXPECT_EQ(recorded.status, 0) << recorded.err;
  // The recording changes nothing of what the program prints.
  const ToolRun plain = runTool({"replay", "--all", example}, "", {{"SENSELOOM_GESTURE_SCRIPT", "gesture_hmm.script"}});
  EXPECT_EQ(recorded.out, plain.out);

  const std::string content = callsOf(contentOf(trace.name));
  const auto calls = std::count(content.begin(), content.end(), '\n');
  EXPECT_NE(recorded.err.find(summaryOf(static_cast<size_t>(calls), trace.name)), std::string::npos) << recorded.err;
  const ToolRun checked = check(trace.name);
  EXPECT_EQ(checked.out, std::to_string(calls) + " calls compared, all as recorded\n");
  EXPECT_EQ(checked.status, 0);
}

INSTANTIATE_TEST_SUITE_P(All, RecordedExample, testing::ValuesIn(exampleNames()),
                         [](const auto& example) { return example.param; });

TEST(Record, RecordsAProgramThatUsesTheLibrary) {
  const ScratchFile trace("embed");
  const ToolRun recorded = recordTo(trace.name, {EMBED_FILE});
  EXPECT_EQ(recorded.status, 0);
  EXPECT_EQ(recorded.out.rfind("  property 41 = 0\n", 0), 0U) << recorded.out;
  // 2 opened, 2 options, 8 records, 2 closed; ctx_uninit() returns nothing.
  EXPECT_EQ(check(trace.name).out, "14 calls compared, all as recorded; 1 without a recorded result\n");
}

TEST(Record, HoldsWhatTheGestureEngineAnsweredAlsoWhenThatWasRecorded) {
  const ScratchFile first("gestures");
  const ScratchFile second("gestures_again");
  recordTo(first.name, {TOOL_FILE, "replay", "gesture_hmm.jsonl"});
  recordTo(second.name, {TOOL_FILE, "replay", first.name}, "", {{"SENSELOOM_GESTURE_SCRIPT", "/dev/null"}});
  const std::string calls = callsOf(contentOf(first.name));
  EXPECT_NE(calls.find(R"("engine":[{"group":2,"name":"NumberOne "}],"returned":1)"), std::string::npos) << calls;
  EXPECT_NE(calls.find(R"("engine":[],"returned":0)"), std::string::npos) << calls;
  EXPECT_EQ(callsOf(contentOf(second.name)), calls);
}

TEST(Record, PassesTheExitStatusAndTheArgumentsOn) {
  const ScratchFile trace("arguments");
  const ToolRun run = recordTo(trace.name, {TOOL_FILE, "replay", "--json", "--", "-"}, "stop\n");
  EXPECT_EQ(run.err.rfind("senseloom: standard input:1: not JSON: ", 0), 0U) << run.err;
  EXPECT_EQ(run.status, 2);
}

TEST(Record, PassesASignalOn) {
#ifdef SANITIZED
  GTEST_SKIP() << "a shell does not have the sanitizer that the recording library needs";
#endif
  const ScratchFile trace("signal");
  EXPECT_EQ(recordTo(trace.name, {"sh", "-c", "kill -9 $$"}).status, -1);
}

TEST(Record, KeepsOtherAuditingLibraries) {
#ifdef SANITIZED
  GTEST_SKIP() << "a shell does not have the sanitizer that the recording library needs";
#endif
  const ScratchFile trace("audit");
  const ToolRun run = recordTo(trace.name, {"sh", "-c", "echo \"$LD_AUDIT\""}, "", {{"LD_AUDIT", AUDIT_LIBRARY}});
  EXPECT_EQ(run.out, AUDIT_LIBRARY ":" AUDIT_LIBRARY "\n");
}

TEST(Record, RefusesAProgramThatCannotBeStarted) {
  const ScratchFile trace("missing");
  const ToolRun run = recordTo(trace.name, {"/no/such/program"});
  EXPECT_EQ(run.err, "senseloom: /no/such/program: No such file or directory\n");
  EXPECT_EQ(run.status, 2);
  EXPECT_EQ(recordTo(trace.name, {"no-such-program"}).err, "senseloom: no-such-program: No such file or directory\n");
  EXPECT_EQ(recordTo(trace.name, {EXAMPLES_FOLDER "/README.md"}).err,
            "senseloom: " EXAMPLES_FOLDER "/README.md: Permission denied\n");
  EXPECT_EQ(runTool({"record", "-o", trace.name}).status, 2);
}

TEST(Record, RefusesAFileThatCannotBeWritten) {
  const ToolRun run = recordTo("/no/such/folder/trace", {TOOL_FILE, "--version"});
  EXPECT_EQ(run.err, "senseloom: /no/such/folder/trace: No such file or directory\n");
  EXPECT_EQ(run.out, "");
  EXPECT_EQ(run.status, 2);
}

}  // namespace
}  // namespace senseloom::tool
