#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/wait.h>

#include <csignal>
#include <cstdio>
#include <fstream>
#include <regex>
#include <sstream>

#include "background_program.h"
#include "program_on_terminal.h"
#include "recording.h"

namespace senseloom::tool {
namespace {

const std::vector<std::string> kWatchDriven{TOOL_FILE, "watch", "--", DRIVEN_FILE};
constexpr char kEntered[] = "\x1b[?1049h";
constexpr char kLeft[] = "\x1b[?1049l";
constexpr char kHeading[] = "what became of the records\r\n";

// The numbers of a table's row, with one blank between all cells.
bool hasRow(const std::string& text, const std::string& row) {
  return std::regex_replace(text, std::regex(" +"), " ").find(row) != std::string::npos;
}

// What came after the screen was left.
std::string afterScreen(const ProgramOnTerminal& program) {
  const std::string& text = program.output();
  const size_t left = text.find(kLeft);
  return left == std::string::npos ? "" : text.substr(left + sizeof kLeft - 1);
}

TEST(WatchedProgram, IsShownWhileItRuns) {
  ProgramOnTerminal watch(kWatchDriven, recordingEnvironment(), true);
  watch.tell("open a LIFT");
  watch.tell("open b PHYAC");
  watch.tell("set b {\"logN\":2}");
  watch.tell("repeat b 3");
  EXPECT_TRUE(hasRow(watch.screenWith("batch filling 3"), "\ns2 PHYAC logN 2 3 0 "));
  watch.tell("repeat a 5");
  EXPECT_TRUE(hasRow(watch.screenWith("class"), "\ns1 LIFT defaults 5 5 "));
  watch.tell("close a");
  watch.screenWith("closed");
  watch.endInput();
  EXPECT_EQ(watch.finish(), 0);
  EXPECT_TRUE(watch.isTerminalAsBefore());
  const std::string after = afterScreen(watch);
  EXPECT_EQ(after.substr(0, 21), "1\r\n1\r\n0\r\n3\r\n5\r\n0\r\nsen") << "what the program printed";
  EXPECT_NE(after.find(kHeading), std::string::npos);
  EXPECT_TRUE(hasRow(after, " s2 PHYAC 3 0 3")) << after;
}

TEST(WatchedProgram, IsShownAsTheKeysSay) {
  ProgramOnTerminal watch(kWatchDriven, recordingEnvironment(), true);
  watch.tell("open a LIFT");
  watch.tell("open b PHYAC");
  watch.screenWith("PHYAC");
  watch.press("s");
  watch.screenWith("session v");
  watch.press("/phy\r");
  EXPECT_EQ(watch.screenWith("2 sessions, 1 with \"phy\"").find("LIFT"), std::string::npos);
  watch.press("\x1b");
  watch.screenWith("LIFT");

  watch.press("p");
  watch.screenWith(", paused");
  watch.tell("repeat b 4000");
  watch.tell("close a");
  watch.press("p");
  watch.screenWith("closed");
  EXPECT_TRUE(hasRow(watch.screenWith("4000"), "\ns2 PHYAC defaults 4000 4000 ")) << "all of it was read";

  watch.press("q");
  const int status = watch.finish();
  EXPECT_TRUE(WIFSIGNALED(status) && WTERMSIG(status) == SIGTERM) << status;
  EXPECT_TRUE(watch.isTerminalAsBefore());
  EXPECT_TRUE(hasRow(afterScreen(watch), " s2 PHYAC 4000 4000")) << watch.output();
}

TEST(WatchedProgram, FitsInto80ColumnsAnd24Lines) {
  ProgramOnTerminal watch(kWatchDriven, recordingEnvironment(), true);
  for (int i = 0; i < 30; ++i) {
    watch.tell("open " + std::to_string(i) + " PHYAC");
    watch.tell("set " + std::to_string(i) + R"( {"logN":12,"logM":3,"classMask":-2,"mode":1,"weightVar":2})");
  }
  watch.tell("repeat 0 1");
  std::istringstream lines(watch.screenWith("30 sessions"));
  size_t count = 0;
  for (std::string line; std::getline(lines, line); ++count) EXPECT_LE(line.size(), 80U + 3 * 2) << line;
  EXPECT_EQ(count, 24U);
  watch.endInput();
  EXPECT_EQ(watch.finish(), 0);
}

TEST(WatchedProgram, LeavesTheTerminalAsItWasWhenItIsKilled) {
  ProgramOnTerminal watch(kWatchDriven, recordingEnvironment(), true);
  watch.tell("open a LIFT");
  watch.tell("dispatch a 1");
  watch.screenWith("LIFT");
  watch.tell("signal 9");
  const int status = watch.finish();
  EXPECT_TRUE(WIFSIGNALED(status) && WTERMSIG(status) == SIGKILL) << status;
  EXPECT_TRUE(watch.isTerminalAsBefore());
  EXPECT_TRUE(hasRow(afterScreen(watch), " s1 LIFT 1 1")) << watch.output();
}

TEST(WatchedProgram, GetsTheInterruptOfTheKeyboard) {
  ProgramOnTerminal watch(kWatchDriven, recordingEnvironment(), true);
  watch.tell("open a LIFT");
  watch.screenWith("LIFT");
  watch.press("\x03");
  const int status = watch.finish();
  EXPECT_TRUE(WIFSIGNALED(status) && WTERMSIG(status) == SIGINT) << status;
  EXPECT_TRUE(watch.isTerminalAsBefore());
}

TEST(WatchedProgram, LeavesTheKeysOfTheTerminalToTheScreen) {
  ProgramOnTerminal watch(kWatchDriven, recordingEnvironment(), false);
  EXPECT_EQ(watch.finish(), 3 << 8) << "its input is empty, so it ends without a call";
  EXPECT_NE(afterScreen(watch).find("loaded libsenseloom, but did not call it"), std::string::npos) << watch.output();
}

TEST(WatchedProgram, HasNoScreenWithoutATerminal) {
  std::vector<std::string> arguments(kWatchDriven.begin() + 1, kWatchDriven.end());
  const ToolRun run = runTool(arguments, "open a LIFT\ndispatch a 1\n", recordingEnvironment());
  EXPECT_EQ(run.out,
            "\nwhat became of the records\n"
            "  session  sensor  records  delivered\n"
            "  s1       LIFT          1          1\n");
  EXPECT_EQ(run.err, "1\n1\nsenseloom: 2 calls recorded in standard output\n");
  EXPECT_EQ(run.status, 0);
}

// What b asks for is negotiated with a, which has no row even so. The first record of b comes before the part.
TEST(WatchedProgram, IsShownAsFarAsItIsWanted) {
  ProgramOnTerminal watch({TOOL_FILE, "watch", "--session", "s2", "--from", "7", "--", DRIVEN_FILE},
                          recordingEnvironment(), true);
  watch.tell("open a PHYAC");
  watch.tell("open b PHYAC");
  watch.tell("set b {\"logN\":2}");
  watch.tell("dispatch b 1");
  watch.tell("repeat a 3");
  watch.tell("repeat b 2");
  const std::string screen = watch.screenWith("batch filling 2");
  EXPECT_TRUE(hasRow(screen, "\ns2 PHYAC logN 2 2 0 ")) << screen;
  EXPECT_EQ(screen.find("s1 "), std::string::npos) << screen;
  watch.endInput();
  EXPECT_EQ(watch.finish(), 0);
  EXPECT_TRUE(hasRow(afterScreen(watch), " s2 PHYAC 2 0 2")) << watch.output();
  EXPECT_EQ(afterScreen(watch).find("s1 "), std::string::npos) << watch.output();
}

TEST(WatchedProgram, IsNotRunForAFilterThatCannotBe) {
  const ToolRun run = runTool({"watch", "--sensor", "LIFTS", "--", "echo", "it", "ran"});
  EXPECT_EQ(run.err, "senseloom: unknown sensor \"LIFTS\": the nearest is \"LIFT\"; `senseloom sensors` prints all\n");
  EXPECT_EQ(run.out, "");
  EXPECT_EQ(run.status, 2);
}

TEST(WatchedProgram, MayNotUseTheLibraryOrNotBeThere) {
  const ToolRun missing = runTool({"watch", "--", "/no/such/program"});
  EXPECT_EQ(missing.err, "senseloom: /no/such/program: No such file or directory\n");
  EXPECT_EQ(missing.status, 2);
#ifndef SANITIZED
  const ToolRun never = runTool({"watch", "--", "true"}, "", recordingEnvironment());
  EXPECT_NE(never.err.find("senseloom: nothing was recorded: true never loaded libsenseloom\n"), std::string::npos);
  EXPECT_EQ(never.out, "");
  EXPECT_EQ(never.status, 3);
#endif
}

constexpr char kOpen[] = R"({"call":"open","session":"a","sensor":"LIFT"})";
constexpr char kDispatch[] = R"({"call":"dispatch","session":"a","record":{"timestamp":1,"class":1}})";

TEST(WatchedTrace, IsLeftByAKey) {
  const ScratchFile trace("watched");
  std::ofstream(trace.name) << kOpen << '\n';
  ProgramOnTerminal watch({TOOL_FILE, "watch", trace.name}, {}, false);
  watch.screenWith("defaults");
  std::ofstream(trace.name, std::ios::app) << kDispatch << '\n';
  watch.screenWith("class 1");
  watch.press("q");
  EXPECT_EQ(watch.finish(), 0);
  EXPECT_TRUE(watch.isTerminalAsBefore());
  EXPECT_TRUE(hasRow(afterScreen(watch), " a LIFT 1 1")) << watch.output();
}

TEST(WatchedTrace, RestoresTheTerminalBeforeItTellsOfABadLine) {
  const ScratchFile trace("watched_bad");
  std::ofstream(trace.name) << kOpen << '\n';
  ProgramOnTerminal watch({TOOL_FILE, "watch", trace.name}, {}, false);
  watch.screenWith("defaults");
  std::ofstream(trace.name, std::ios::app) << "[]\n";
  EXPECT_EQ(watch.finish(), 2 << 8);
  EXPECT_TRUE(watch.isTerminalAsBefore());
  EXPECT_EQ(afterScreen(watch), "senseloom: " + trace.name + ":2: not a JSON object\r\n");
}

TEST(WatchedTrace, HasNoScreenOnATerminalThatCannotShowOne) {
  const ScratchFile trace("watched_dumb");
  std::ofstream(trace.name) << "{\"format\":1}\n" << kOpen << "\n{\"end\":1,\"lost\":0}\n";
  ProgramOnTerminal watch({TOOL_FILE, "watch", trace.name}, {{"TERM", "dumb"}}, false);
  EXPECT_EQ(watch.finish(), 0);
  EXPECT_EQ(watch.output().find(kEntered), std::string::npos);
}

TEST(WatchedTrace, ComesThroughANamedPipe) {
  const ScratchFile pipe("watched_pipe");
  ASSERT_EQ(mkfifo(pipe.name.c_str(), 0600), 0);
  BackgroundProgram watch({TOOL_FILE, "watch", pipe.name});
  std::ofstream(pipe.name) << kOpen << '\n' << kDispatch << '\n';
  const ToolRun run = watch.finish();
  EXPECT_TRUE(hasRow(run.out, " a LIFT 1 1")) << run.out;
  EXPECT_EQ(run.status, 0);
}

TEST(WatchedTrace, IsSummedUpWhenItIsInterrupted) {
  BackgroundProgram watch({TOOL_FILE, "watch", "-"});
  watch.tell(kOpen);
  watch.tell(kDispatch);
  watch.waitUntilItWaits();
  watch.send(SIGINT);
  const ToolRun run = watch.finish();
  EXPECT_TRUE(hasRow(run.out, " a LIFT 1 1")) << run.out;
  EXPECT_EQ(run.status, -1);
}

}  // namespace
}  // namespace senseloom::tool
