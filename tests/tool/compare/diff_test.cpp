#include <gtest/gtest.h>

#include <fstream>
#include <string>

#include "recording.h"

namespace senseloom::tool {
namespace {

// Compares two traces, written to files that the messages call L and R.
ToolRun diff(const std::string& left, const std::string& right, std::vector<std::string> arguments = {}) {
  const ScratchFile leftFile("left_trace");
  const ScratchFile rightFile("right_trace");
  std::ofstream(leftFile.name) << left;
  std::ofstream(rightFile.name) << right;
  arguments.insert(arguments.begin(), {"diff", leftFile.name, rightFile.name});
  ToolRun run = runTool(arguments);
  for (std::string* text : {&run.out, &run.err}) {
    for (const auto& [name, mark] : {std::pair(leftFile.name, 'L'), std::pair(rightFile.name, 'R')}) {
      for (size_t at; (at = text->find(name)) != std::string::npos;) text->replace(at, name.size(), 1, mark);
    }
  }
  return run;
}

constexpr char kLeft[] = R"({"call":"open","session":"a","sensor":"STAP"}
{"call":"open","session":"b","sensor":"GSFLK"}
{"call":"set_option","session":"a","option":{"level":1},"returned":0,"properties":[{"id":101,"size":4,"value":"03000000"}]}
{"call":"dispatch","session":"b","record":{"timestamp":1,"class":1}}
{"call":"dispatch","session":"a","record":{"timestamp":2,"classes":1}}
{"call":"close","session":"a"}
)";

TEST(Diff, FindsTracesAlikeWhoseSessionsAreInAnotherOrder) {
  const ToolRun run = diff(kLeft, R"({"call":"open","session":"b","sensor":"GSFLK"}
{"call":"dispatch","session":"b","record":{"hex":"01000000000000000100"}}
{"note":"what follows"}
{"call":"open","session":"a","sensor":"STAP"}
{"call":"set_option","session":"a","option":{"level":1}}
{"call":"dispatch","session":"a","record":{"timestamp":2,"classes":1}}
{"call":"close","session":"a"}
)");
  EXPECT_EQ(run.out, "6 calls compared, all alike\n");
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.status, 0);
}

TEST(Diff, TellsWhatTheGestureEnginesAnswered) {
  const std::string gesture = R"({"call":"dispatch","sensor":"GSPX","record":{"timestamp":1,"prx":0,"samples":[]})";
  const std::string letters = R"(,"engine":[{"group":0,"name":"LetterA "},{"group":1,"name":"LetterB "}]})";
  EXPECT_EQ(diff(gesture + letters, gesture + R"(,"engine":[]})").out,
            "L:1 and R:1: dispatch to all of GSPX differs\n"
            "  what            left                    right\n"
            "  gesture engine  \"LetterA \", \"LetterB \"  nothing\n"
            "  the first difference of this session: what follows may come of it\n");
  EXPECT_EQ(diff(gesture + letters, gesture + letters).out, "1 calls compared, all alike\n");
  EXPECT_EQ(diff(gesture + letters, gesture + '}').out, "1 calls compared, all alike\n");
}

constexpr char kRight[] = R"({"call":"open","session":"a","sensor":"STAP"}
{"call":"open","session":"b","sensor":"GSFLK"}
{"call":"set_option","session":"a","option":{"level":2},"returned":0,"properties":[{"id":101,"size":4,"value":"01000000"}]}
{"call":"dispatch","session":"a","record":{"timestamp":2,"classes":3}}
{"call":"dispatch","session":"b","record":{"timestamp":1,"class":1}}
{"call":"dispatch","session":"b","record":{"timestamp":9,"class":1}}
{"call":"close","session":"a"}
)";

TEST(Diff, TellsWhatDiffersInTheWordsOfACheck) {
  const ToolRun run = diff(kLeft, kRight);
  EXPECT_EQ(run.out,
            "L:3 and R:3: set_option of session \"a\" differs\n"
            "  what           left         right\n"
            "  option         {\"level\":1}  {\"level\":2}\n"
            "  101 classMask  3            1\n"
            "  the first difference of this session: what follows may come of it\n"
            "L:5 and R:4: dispatch of session \"a\" differs\n"
            "  what     left  right\n"
            "  classes  1     3\n"
            "R:6: dispatch of session \"b\" is only there\n");
  EXPECT_EQ(run.err, "senseloom: 3 of 7 calls compared differ\n");
  EXPECT_EQ(run.status, 1);
}

TEST(Diff, ComparesTheSessionsThatAreWanted) {
  EXPECT_EQ(diff(kLeft, kRight, {"--session", "b"}).out, "R:6: dispatch of session \"b\" is only there\n");
}

TEST(Diff, ComparesTheCallsThatAreWanted) {
  EXPECT_EQ(diff(kLeft, kRight, {"--sensor", "GSFLK"}).out, "R:6: dispatch of session \"b\" is only there\n");
  EXPECT_EQ(diff(kLeft, kRight, {"--to", "2"}).out, "2 calls compared, all alike\n");
  EXPECT_EQ(diff(kLeft, kRight, {"--time-unit", "ms", "--from", "7ms"}).out,
            "R:7: close of session \"a\" is only there\n"
            "R:6: dispatch of session \"b\" is only there\n");
}

TEST(Diff, ComparesTheCallsThatFailed) {
  const std::string open = R"({"call":"open","session":"a","sensor":"STAP","returned":"handle"})";
  const std::string wrong = R"({"call":"set_option","session":"a","option":"{","returned":-1})";
  const std::string otherWrong = R"({"call":"set_option","session":"a","option":"[","returned":-1})";
  const std::string right = R"({"call":"set_option","session":"a","option":"{}","returned":0})";
  EXPECT_EQ(diff(open + '\n' + wrong, open + '\n' + right + '\n' + otherWrong, {"--failed"}).out,
            "L:2 and R:3: set_option of session \"a\" differs\n"
            "  what    left  right\n"
            "  option  {     [\n"
            "  the first difference of this session: what follows may come of it\n");
  EXPECT_EQ(diff(kLeft, R"({"call":"uninit"})", {"--failed"}).err,
            "senseloom: R: --failed takes a recording: this trace does not tell what its calls returned, but "
            "\"senseloom replay --failed\" does\n");
}

TEST(Diff, PrintsNoMoreThanIsWanted) {
  const ToolRun run = diff(kLeft, kRight, {"--limit", "1"});
  EXPECT_NE(run.out.find("may come of it\n2 more calls differ\n"), std::string::npos) << run.out;
  EXPECT_EQ(diff(kLeft, kRight, {"--limit", "1", "--json"}).out,
            R"({"session":"a","call":"set_option","leftLine":3,"rightLine":3,"isFirst":true,"differences":[)"
            R"({"what":"option","left":"{\"level\":1}","right":"{\"level\":2}"},)"
            R"({"what":"101 classMask","left":"3","right":"1"}]})"
            "\n");
}

TEST(Diff, ReportsBadInput) {
  EXPECT_EQ(diff(kLeft, "stop\n").err.rfind("senseloom: R:1: not JSON: ", 0), 0U);
  EXPECT_EQ(runTool({"diff", "lift.jsonl", "none.jsonl"}).err, "senseloom: none.jsonl: No such file or directory\n");
  EXPECT_EQ(runTool({"diff", "lift.jsonl", "none.jsonl"}).status, 2);
}

}  // namespace
}  // namespace senseloom::tool
