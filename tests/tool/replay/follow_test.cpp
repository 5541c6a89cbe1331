#include <gtest/gtest.h>

#include <regex>
#include <string>
#include <vector>

#include "background_program.h"
#include "recording.h"

namespace senseloom::tool {
namespace {

constexpr char kOpenLine[] = R"({"call":"open","session":"a","sensor":"LIFT"})";
constexpr char kSetOption[] = R"({"call":"set_option","session":"a","option":{}})";
constexpr char kDispatch[] = R"({"call":"dispatch","session":"a","record":{"timestamp":1,"class":1}})";

// Whether a line of a table has these cells, whatever the blanks between them.
bool hasCells(const std::string& line, const std::string& cells) {
  return std::regex_replace(line, std::regex(" +"), " ").find(cells) != std::string::npos;
}

TEST(FollowingCommand, PrintsEachLineOfAGrowingRecordingAtOnce) {
  const ScratchFile trace("followed_recording");
  Environment environment = recordingEnvironment();
  environment.emplace_back("LD_AUDIT", AUDIT_LIBRARY);
  environment.emplace_back("SENSELOOM_TRACE", trace.name);
  BackgroundProgram driven({DRIVEN_FILE}, environment);
  EXPECT_EQ(driven.ask("open a LIFT"), "1");
  BackgroundProgram replay({TOOL_FILE, "replay", "--follow", trace.name});
  BackgroundProgram explain({TOOL_FILE, "explain", "--records", "--follow", trace.name});
  replay.readLine();
  EXPECT_TRUE(hasCells(replay.readLine(), " open s1 LIFT handle"));
  EXPECT_EQ(driven.ask("dispatch a 1"), "1");
  EXPECT_TRUE(hasCells(replay.readLine(), " dispatch s1 LIFT 1 "));
  EXPECT_EQ(explain.readLine(), "line 3: s1 on LIFT delivered");
  EXPECT_EQ(driven.ask("close a"), "0");
  EXPECT_TRUE(hasCells(replay.readLine(), " close s1 LIFT 0"));
  driven.finish();
  EXPECT_EQ(replay.finish().status, 0);
  EXPECT_EQ(explain.finish().status, 0);
}

TEST(FollowingCommand, IsNotNeededForAPipe) {
  for (const std::vector<std::string>& options : {std::vector<std::string>{}, {"--follow"}}) {
    std::vector<std::string> command{TOOL_FILE, "explain", "--records", "-"};
    command.insert(command.end(), options.begin(), options.end());
    BackgroundProgram explain(command);
    explain.tell(kOpenLine);
    EXPECT_NE(explain.ask(kDispatch).find("a on LIFT"), std::string::npos);
    EXPECT_NE(explain.ask(kDispatch).find("a on LIFT"), std::string::npos);
    EXPECT_EQ(explain.finish().status, 0);
  }
}

// Runs a line of the shell that uses $OPEN, $SET and $DISPATCH, lines of a trace, and $TOOL.
ToolRun runShell(const std::string& line, const Environment& more = {}) {
  Environment environment{{"OPEN", kOpenLine}, {"SET", kSetOption}, {"DISPATCH", kDispatch}, {"TOOL", TOOL_FILE}};
  environment.insert(environment.end(), more.begin(), more.end());
  return BackgroundProgram({"/bin/sh", "-c", line}, environment).finish();
}

constexpr char kFirstLine[] = "line 2: a on LIFT sets {}\n";

// The status is that of a program that SIGPIPE ended. A trace without an end stands for a long one.
TEST(OutputCutShort, IsThereAtOnceAndEndsTheCommandHoweverLongTheTraceIs) {
  const ToolRun run = runShell(
      "{ printf '%s\\n' \"$OPEN\" \"$SET\"; timeout 60 yes \"$DISPATCH\"; } | "
      "{ \"$TOOL\" explain -; echo $? >&2; } | head -n 1");
  EXPECT_EQ(run.out, kFirstLine);
  EXPECT_EQ(run.err, "141\n");
}

// The rest of the trace comes when the reader of the output has gone.
TEST(OutputCutShort, LeavesAPictureWhole) {
  const ScratchFolder folder("picture_of_a_pipe");
  const ToolRun run = runShell(
      "mkfifo \"$GONE\"; "
      "{ printf '%s\\n' \"$OPEN\" \"$SET\"; read -r _ <\"$GONE\"; yes \"$DISPATCH\" | head -n 3000; } | "
      "\"$TOOL\" explain --plot \"$PICTURE\" - | "
      "{ IFS= read -r line; echo \"$line\" >&2; exec <&-; echo >\"$GONE\"; }",
      {{"GONE", folder.file("gone")}, {"PICTURE", folder.file("picture.svg")}});
  EXPECT_EQ(run.err, kFirstLine);
  EXPECT_NE(contentOf(folder.file("picture.svg")).find("</svg>"), std::string::npos);
}

TEST(FollowingCommand, RefusesWhatIsCompressed) {
  const ScratchFolder folder("followed_compressed");
  const std::string trace = folder.file("trace.gz");
  EXPECT_EQ(recordDriven(trace, "open a LIFT\n").status, 0);
  const ToolRun run = runTool({"explain", "--follow", trace});
  EXPECT_EQ(run.err, "senseloom: " + trace +
                         ": what is compressed cannot be followed, but it can be read when it is complete\n");
  EXPECT_EQ(run.status, 2);
}

}  // namespace
}  // namespace senseloom::tool
