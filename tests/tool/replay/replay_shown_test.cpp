#include <gtest/gtest.h>

#include <fstream>
#include <sstream>
#include <string>

#include "recording.h"

namespace senseloom::tool {
namespace {

const std::string kTrace = R"({"note":"a walk","timeUnit":"ms","classNames":["none","left","right"]}
{"call":"open","session":"a","sensor":"GSFLK"}
{"call":"open","session":"b","sensor":"STAP"}
{"call":"set_option","session":"a","option":{"classMask":2}}
{"call":"dispatch","session":"a","record":{"timestamp":1000,"class":2}}
{"call":"dispatch","session":"b","record":{"timestamp":2500,"classes":1}}
{"call":"set_option","session":"b","option":"{"}
{"call":"dispatch","session":"a","record":{"timestamp":61000,"class":1}}
{"note":"lines missing here: 3","why":"No space left on device"}
{"call":"close","session":"b"}
)";

std::string replayed(std::vector<std::string> arguments) {
  arguments.insert(arguments.begin(), "replay");
  arguments.emplace_back("-");
  const ToolRun run = runTool(arguments, kTrace);
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.status, 0);
  return run.out;
}

// The numbers of the lines whose rows are printed.
std::string linesOf(const std::vector<std::string>& arguments) {
  std::istringstream rows(replayed(arguments));
  std::string lines;
  std::string row;
  std::getline(rows, row);  // the heading
  while (std::getline(rows, row)) {
    std::istringstream cells(row);
    std::string line;
    cells >> line;
    lines += (lines.empty() ? "" : " ") + line;
  }
  return lines;
}

TEST(ReplayShows, WhatWentInAndWhatCameOut) {
  EXPECT_EQ(replayed({"--all"}),
            "  line  call        session   sensor  return  outcome\n"
            "     1  note                                  a walk\n"
            "     2  open        a         GSFLK   handle\n"
            "     3  open        b         STAP    handle\n"
            "     4  set_option  a         GSFLK   0       {\"classMask\":2} -> 61 classMask=2, 62 level=0\n"
            "     5  dispatch    a         GSFLK   1       timestamp=1000 class=2 (right) -> the record\n"
            "     6  dispatch    b         STAP    1       timestamp=2500 classes=1 -> the record\n"
            "     7  set_option  b         STAP    -1      { -> failed\n"
            "     8  dispatch    a         GSFLK   0       timestamp=61000 class=1 (left)\n"
            "     9  note                                  lines missing here: 3: No space left on device\n"
            "    10  close       b         STAP    0\n"
            "   end  close       a         GSFLK   0\n");
}

TEST(ReplayShows, RecordsAsBytesWhenAsked) {
  EXPECT_NE(replayed({"--hex"}).find("  e8030000000000000200 -> the record\n"), std::string::npos);
}

TEST(ReplayShows, OnlyCallsThatAreWanted) {
  EXPECT_EQ(linesOf({"--session", "b"}), "3 6 7 10");
  EXPECT_EQ(linesOf({"--session", "b", "--session", "a"}), "2 3 4 5 6 7 10 end");
  EXPECT_EQ(linesOf({"--sensor", "GSFLK"}), "2 4 5 end");
  EXPECT_EQ(linesOf({"--failed"}), "7");
  EXPECT_EQ(linesOf({"--from", "4", "--to", "6"}), "4 5 6");
  EXPECT_EQ(linesOf({"--from", "1.5s", "--to", "50s"}), "6 7");
  EXPECT_EQ(linesOf({"--all", "--from", "60s"}), "8 10 end");
}

TEST(ReplayShows, TheSameInEveryForm) {
  EXPECT_EQ(replayed({"--quiet", "--session", "b"}),
            "session  sensor    opened   records   results    failed\n"
            "b        STAP           1         1         1         1\n");
  EXPECT_EQ(replayed({"--json", "--failed"}),
            R"({"line":7,"call":"set_option","session":"b","sensor":"STAP","return":-1,"option":"{","properties":null})"
            "\n");
  EXPECT_NE(
      replayed({"--json"})
          .find(
              R"("sensor":"GSFLK","return":1,"record":{"timestamp":1000,"class":2},"recordHex":"e8030000000000000200",)"),
      std::string::npos);
  EXPECT_NE(replayed({"--json"}).find("{\"line\":9,\"note\":\"lines missing here: 3: No space left on device\"}\n"),
            std::string::npos);
  const ToolRun explained = runTool({"explain", "--session", "b", "--records", "-"}, kTrace);
  EXPECT_EQ(explained.out,
            "line 6: b on STAP delivered\n"
            "\n"
            "line 7: b on STAP sets {\n"
            "  not JSON (string or '}' expected near end of file): refused\n"
            "  refused: nothing changes\n"
            "\n"
            "line 10: b on STAP leaves\n"
            "\n"
            "what became of the records\n"
            "  session  sensor  records  delivered\n"
            "  b        STAP          1          1\n");
}

TEST(ReplayShows, WhenCallsWereMade) {
  EXPECT_NE(replayed({"--times", "elapsed"}).find("\n     6  0:00:01.500   dispatch    b "), std::string::npos);
  EXPECT_NE(replayed({"--times", "clock"}).find("\n     6  1970-01-01 00:00:02.500  dispatch    b "),
            std::string::npos);
  const std::string recording = R"({"format":1,"started":"2026-11-21T21:31:57.250000Z","clock":"CLOCK_MONOTONIC"}
{"call":"open","session":"s1","sensor":"LIFT","atUs":1500000}
{"end":1,"lost":0}
)";
  EXPECT_NE(runTool({"replay", "--times", "clock", "-"}, recording)
                .out.find("\n     2  2026-11-21 21:31:58.750  open        s1 "),
            std::string::npos);
  EXPECT_NE(runTool({"replay", "--times", "elapsed", "--from", "1s", "-"}, recording)
                .out.find("\n     2  0:00:01.500   open        s1 "),
            std::string::npos);
}

TEST(ReplayShows, NamesOfClassesFromAFile) {
  const ScratchFile names("class_names");
  std::ofstream(names.name) << "still\nup\ndown\n";
  EXPECT_NE(replayed({"--class-names", names.name}).find("class=2 (down)"), std::string::npos);
  EXPECT_NE(replayed({"--class-names", "x,y,z"}).find("class=2 (z)"), std::string::npos);
  const ToolRun digits =
      runTool({"replay", "gesture_hmm.jsonl"}, "", {{"SENSELOOM_GESTURE_SCRIPT", "gesture_hmm.script"}});
  EXPECT_NE(digits.out.find("class=1 (1)\n"), std::string::npos) << digits.out;
}

TEST(ReplayShows, ErrorsAboutWhatIsWanted) {
  const auto errorOf = [](std::vector<std::string> arguments, const std::string& trace = kTrace) {
    arguments.insert(arguments.begin(), "replay");
    arguments.emplace_back("-");
    const ToolRun run = runTool(arguments, trace);
    EXPECT_EQ(run.status, 2);
    return run.err;
  };
  EXPECT_EQ(errorOf({"--sensor", "STOP"}),
            "senseloom: unknown sensor \"STOP\": the nearest is \"STAP\"; `senseloom sensors` prints all\n");
  EXPECT_EQ(errorOf({"--from", "1.5"}),
            "senseloom: \"1.5\" is neither a line, such as 120, nor a time with its unit, such as 5.2s\n");
  EXPECT_EQ(errorOf({"--to", "5min"}), "senseloom: unknown time unit \"min\": s, ms, us and ns are known\n");
  EXPECT_EQ(errorOf({"--to", "5s"}, R"({"call":"open","session":"a","sensor":"LIFT"}
{"call":"dispatch","session":"a","record":{"timestamp":1,"class":1}}
)"),
            "senseloom: standard input:2: the trace does not tell the unit of its timestamps: --time-unit does\n");
  EXPECT_EQ(errorOf({}, "{\"note\":\"x\",\"classNames\":3}\n"),
            "senseloom: standard input:1: \"classNames\" must be an array of strings\n");
}

}  // namespace
}  // namespace senseloom::tool
