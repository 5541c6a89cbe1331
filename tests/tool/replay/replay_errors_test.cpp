#include <gtest/gtest.h>

#include <string>
#include <utility>

#include "run_tool.h"

namespace senseloom::tool {
namespace {

const std::string kOpen = R"({"call":"open","session":"a","sensor":"STAP"})"
                          "\n";
const std::string kHeading = "  line  call        session   sensor  return  outcome\n";
const std::string kOpenRow = "     1  open        a         STAP    handle\n";

// Replays a trace that opens session "a" on "STAP" and goes on with `line`, and expects that to be an error.
void expectError(const std::string& line, const std::string& message) {
  const ToolRun run = runTool({"replay", "-"}, kOpen + line + "\n");
  EXPECT_EQ(run.err, "senseloom: standard input:2: " + message + "\n") << line;
  EXPECT_EQ(run.out, kHeading + kOpenRow) << line;
  EXPECT_EQ(run.status, 2) << line;
}

TEST(ReplayErrors, NamesAFileThatDoesNotExist) {
  const ToolRun run = runTool({"replay", "no-such-file.jsonl"});
  EXPECT_EQ(run.err, "senseloom: no-such-file.jsonl: No such file or directory\n");
  EXPECT_EQ(run.out, "");
  EXPECT_EQ(run.status, 2);
}

TEST(ReplayErrors, NamesAFileThatCannotBeRead) {
  const ToolRun run = runTool({"replay", "../examples"});
  EXPECT_EQ(run.err, "senseloom: ../examples: cannot be read: Is a directory\n");
  EXPECT_EQ(run.status, 2);
}

TEST(ReplayErrors, NamesFileAndLine) {
  const ToolRun run = runTool({"replay", "README.md"});
  EXPECT_EQ(run.err.rfind("senseloom: README.md:1: not JSON: ", 0), 0U) << run.err;
  EXPECT_EQ(run.status, 2);
}

TEST(ReplayErrors, RefusesALineThatIsNotJson) {
  const ToolRun run = runTool({"replay", "-"}, kOpen + "\nclose a\n");
  EXPECT_EQ(run.err.rfind("senseloom: standard input:3: not JSON: ", 0), 0U) << run.err;
  EXPECT_EQ(run.out, kHeading + kOpenRow);
  EXPECT_EQ(run.status, 2);
}

TEST(ReplayErrors, RefusesALineThatIsNotACall) {
  expectError("[1]", "not a JSON object");
  expectError(R"({"call":"open","session":"b","sensor":"TAP"})",
              "unknown sensor \"TAP\": the nearest is \"STAP\"; `senseloom sensors` prints all");
}

TEST(ReplayErrors, RefusesSessionsThatAreNotOpen) {
  expectError(R"({"call":"set_option","session":"b","option":{}})", "no session \"b\" is open");
  expectError(R"({"call":"dispatch","session":"b","record":{"hex":""}})", "no session \"b\" is open");
  expectError(R"({"call":"close","session":"b"})", "no session \"b\" is open");
}

TEST(ReplayErrors, RefusesASessionThatWasClosedAlready) {
  const ToolRun run = runTool({"replay", "-"},
                              kOpen + R"({"call":"close","session":"a"})" + "\n" + R"({"call":"close","session":"a"})");
  EXPECT_EQ(run.err, "senseloom: standard input:3: no session \"a\" is open\n");
  EXPECT_EQ(run.out, kHeading + kOpenRow + "     2  close       a         STAP    0\n");
  EXPECT_EQ(run.status, 2);
}

TEST(ReplayErrors, RefusesTheNameOfAnOpenSessionForAnother) {
  expectError(R"({"call":"open","session":"a","sensor":"STAP"})", "session \"a\" is already open");
  expectError(R"({"call":"open","session":"a","sensor":"PHYAC"})", "session \"a\" is already open");
}

TEST(ReplayErrors, RefusesRecordsThatAreNotOfTheirSensor) {
  expectError(R"({"call":"dispatch","session":"a","record":{"timestamp":1,"class":1}})",
              "unknown record field \"class\"; the nearest is \"classes\"");
  // Even if no session would get it.
  expectError(R"({"call":"dispatch","sensor":"LIFT","record":{}})", "missing record field \"timestamp\"");
}

TEST(ReplayErrors, ClosesWhatTheTraceOpened) {
  const ToolRun run = runTool({"replay", "-"}, R"({"call":"open","session":"a","sensor":"LPE_P"}
{"call":"open","session":"b","sensor":"LPE_P"}
{"call":"open","session":"c","sensor":"PHYAC"}
{"call":"set_option","session":"c","option":{}}
stop
)");
  EXPECT_EQ(run.err.rfind("deactivating aware session...\nsenseloom: standard input:5: not JSON: ", 0), 0U) << run.err;
  EXPECT_EQ(run.out, kHeading +
                         "     1  open        a         LPE_P   handle\n"
                         "     2  open        b         LPE_P   handle\n"
                         "     3  open        c         PHYAC   handle\n"
                         "     4  set_option  c         PHYAC   0       {} -> 41 mode=0, 43 spans=65537 (1, 1), 44 "
                         "decisionsPerSpan=1, "
                         "42 classMask=-1\n");
  EXPECT_EQ(run.status, 2);
}

TEST(ReplayErrors, PrintsNoSummaryOfATraceThatStoppedShort) {
  const ToolRun run = runTool({"replay", "--quiet", "-"}, kOpen + "stop\n");
  EXPECT_EQ(run.out, "");
  EXPECT_EQ(run.status, 2);
}

TEST(ReplayErrors, PrintsTheObjectsBeforeTheError) {
  const ToolRun run = runTool({"replay", "--json", "-"}, kOpen + R"({"call":"close","session":"b"})");
  EXPECT_EQ(run.out, R"({"line":1,"call":"open","session":"a","sensor":"STAP","return":"handle"})"
                     "\n");
  EXPECT_EQ(run.err, "senseloom: standard input:2: no session \"b\" is open\n");
  EXPECT_EQ(run.status, 2);
}

}  // namespace
}  // namespace senseloom::tool
