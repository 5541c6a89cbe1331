#include <gtest/gtest.h>

#include <csignal>
#include <cstring>
#include <fstream>
#include <string>

#include "background_program.h"
#include "recording.h"

namespace senseloom::tool {
namespace {

constexpr char kStart[] = "open a PHYAC\nset a {\"logN\":3}\nrepeat a 100\n";

class RecordedSignal : public testing::TestWithParam<int> {};

TEST_P(RecordedSignal, LeavesEveryFinishedCallAndTheCause) {
  const ScratchFile trace("signal");
  const ToolRun run = recordDriven(trace.name, kStart + ("signal " + std::to_string(GetParam())) + "\n");
  EXPECT_EQ(run.status, -1);
  EXPECT_EQ(run.err, summaryOf(102, trace.name));
  const ToolRun checked = check(trace.name);
  EXPECT_EQ(checked.out, "102 calls compared, all as recorded\n");
  // Before it are the head, the calls and the release of a property list.
  EXPECT_EQ(checked.err,
            "senseloom: " + trace.name + ":105: the program was ended by a signal: " + strsignal(GetParam()) + "\n");
}

INSTANTIATE_TEST_SUITE_P(All, RecordedSignal, testing::Values(SIGINT, SIGTERM, SIGKILL, SIGABRT),
                         [](const auto& signal) { return std::string("Number") + std::to_string(signal.param); });

TEST(RecordEnds, IsKnownOfARecordingThatNobodyCompleted) {
  const ScratchFile trace("killed");
  {
    Environment environment = recordingEnvironment();
    environment.emplace_back("LD_AUDIT", AUDIT_LIBRARY);
    environment.emplace_back("SENSELOOM_TRACE", trace.name);
    BackgroundProgram program({DRIVEN_FILE}, environment);
    EXPECT_EQ(program.ask("open a LIFT"), "1");
    EXPECT_EQ(program.ask("dispatch a 1"), "1");
    program.send(SIGKILL);
    program.finish();
  }
  const std::string cutShort = "the recording was cut short after 2 calls: its end is missing\n";
  const ToolRun checked = check(trace.name);
  EXPECT_EQ(checked.out, "2 calls compared, all as recorded\n");
  EXPECT_EQ(checked.err, "senseloom: " + trace.name + ": " + cutShort);
  EXPECT_EQ(checked.status, 0);
  // The same of one that was cut in the middle of a line.
  std::string content = contentOf(trace.name);
  content.resize(content.find('\0') - 5);
  std::ofstream(trace.name) << content;
  EXPECT_NE(check(trace.name).err.find("cut short after 1 calls"), std::string::npos);
}

TEST(RecordEnds, TellsOfASignalFromAnotherProcessToTheProgram) {
  const ScratchFile trace("passed_on");
  BackgroundProgram tool({TOOL_FILE, "record", "-o", trace.name, "--", DRIVEN_FILE}, recordingEnvironment());
  EXPECT_EQ(tool.ask("open a LIFT"), "1");
  tool.send(SIGTERM);
  EXPECT_EQ(tool.readLine(), "") << "before the end of its input";
  const ToolRun run = tool.finish();
  EXPECT_EQ(run.status, -1);
  EXPECT_EQ(run.err, summaryOf(1, trace.name));
  EXPECT_EQ(check(trace.name).status, 0);
}

TEST(RecordEnds, TellsWhatADiskThatIsFullHadNoRoomFor) {
  const ScratchFile trace("full");
  const ToolRun run = recordDriven(trace.name, std::string("limit 8192\n") + kStart);
  EXPECT_EQ(run.status, 0);
  EXPECT_NE(run.err.find(" lines could not be recorded: File too large\n"), std::string::npos) << run.err;
  const ToolRun checked = check(trace.name);
  EXPECT_EQ(checked.status, 0) << checked.out;
  EXPECT_NE(checked.err.find(" lines could not be recorded: File too large\n"), std::string::npos) << checked.err;
}

TEST(RecordEnds, IsNoSuccessWhenNothingWasRecorded) {
  const ScratchFile trace("nothing");
  const ToolRun unused = recordTo(trace.name, {TOOL_FILE, "--version"});
  EXPECT_EQ(unused.err, "senseloom: nothing was recorded: " TOOL_FILE " loaded libsenseloom, but did not call it\n");
  EXPECT_EQ(unused.status, 3);
  const ToolRun full = recordDriven("/dev/full", "open a LIFT\n");
  EXPECT_NE(full.err.find("senseloom: nothing was recorded: none of 1 call of "), std::string::npos) << full.err;
  EXPECT_EQ(full.status, 3);
#ifndef SANITIZED
  const ToolRun never = recordTo(trace.name, {"true"});
  EXPECT_NE(never.err.find("senseloom: nothing was recorded: true never loaded libsenseloom\n"), std::string::npos);
  EXPECT_EQ(never.status, 3);
#endif
  EXPECT_FALSE(std::ifstream(trace.name).is_open());
}

// What is told of a breach, without the numbers of threads.
std::string breachIn(const std::string& lines, const std::string& kind) {
  const ScratchFile trace("breach");
  const ToolRun run = recordDriven(trace.name, lines);
  EXPECT_NE(run.err.find(" broke the library's contract, 1 note in the trace: "), std::string::npos) << run.err;
  EXPECT_NE(contentOf(trace.name).find(R"("breach":")" + kind + R"(","threads":[)"), std::string::npos);
  const std::string told = check(trace.name).err;
  EXPECT_NE(runTool({"explain", trace.name}).err.find(told.substr(0, told.find('\n'))), std::string::npos);
  const size_t start = told.find(": ", told.find(trace.name)) + 2;
  std::string text;
  for (const char c : told.substr(start, told.find('\n') - start)) {
    if (c < '0' || c > '9' || text.back() == 's') text += c;
  }
  return text;
}

TEST(RecordEnds, TellsOfTwoThreadsAtOnce) {
  EXPECT_EQ(breachIn("open a PHYAC\nrace a {}\n", "two threads"),
            "two threads are in the library at once: set_option in thread , dispatch in thread ");
}

TEST(RecordEnds, TellsOfAHandleThatIsUsedAfterItWasClosed) {
  EXPECT_EQ(breachIn("open a LIFT\nclose a\ndispatch a 1\ndispatch a 1\n", "closed session"),
            "the handle of session s1 is used after it was closed in thread : dispatch in thread ");
}

TEST(RecordEnds, TellsOfAResultThatIsUsedTooLate) {
  EXPECT_EQ(breachIn("open a PHYAC\nopen b PHYAC\nset a {\"logN\":1}\nstale a b\n", "result out of date"),
            "a record is in the memory of a result of session s1, which ended with the session's next record: given in "
            "thread , used in thread ");
}

TEST(RecordEnds, TellsOfAListThatIsReleasedTwiceBeforeTheProgramEndsOfIt) {
#ifdef SANITIZED
  GTEST_SKIP() << "the sanitizer ends the program in its own way";
#endif
  EXPECT_EQ(breachIn("open a LIFT\nrelease a {}\n", "list released twice"),
            "a property list is released twice: first in thread , again in thread ");
}

TEST(RecordEnds, EndsAReplayThatIsInterruptedWithItsSummary) {
  BackgroundProgram replay({TOOL_FILE, "replay", "--quiet", "-"});
  replay.tell(R"({"call":"open","session":"a","sensor":"LIFT"})");
  replay.waitUntilItWaits();
  replay.send(SIGINT);
  const ToolRun run = replay.finish();
  EXPECT_EQ(run.status, -1);
  EXPECT_EQ(run.out,
            "session  sensor    opened   records   results    failed\n"
            "a        LIFT           1         0         0         0\n");
}

TEST(RecordEnds, EndsWhatIsInterruptedWithAWholeFile) {
  const ScratchFolder folder("interrupted");
  for (const std::vector<std::string>& command :
       {std::vector<std::string>{TOOL_FILE, "convert", "--to", "perfetto", "-o", folder.file("events"), "-"},
        {TOOL_FILE, "view", "-o", folder.file("page"), "-"}}) {
    BackgroundProgram tool(command);
    tool.tell(R"({"call":"open","session":"a","sensor":"LIFT"})");
    tool.waitUntilItWaits();
    tool.send(SIGINT);
    EXPECT_EQ(tool.finish().status, -1);
  }
  EXPECT_EQ(folder.files(), (std::vector<std::string>{"events", "page"}));
  EXPECT_NE(contentOf(folder.file("page")).find("</html>"), std::string::npos);
}

TEST(RecordEnds, KeepsOnlyTheWholeTracesOfATableThatIsInterrupted) {
  const ScratchFolder folder("interrupted_table");
  BackgroundProgram tool({TOOL_FILE, "convert", "--from", "csv", "--columns", "recording=who", "-o", folder.name, "-"});
  tool.tell("who,time,class\nann,1,2\nben,1,2");
  tool.waitUntilItWaits();
  tool.send(SIGINT);
  EXPECT_EQ(tool.finish().status, -1);
  EXPECT_EQ(folder.files(), (std::vector<std::string>{"ann.jsonl"}));
}

}  // namespace
}  // namespace senseloom::tool
