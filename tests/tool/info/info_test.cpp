#include <gtest/gtest.h>

#include <algorithm>
#include <string>

#include "run_tool.h"

namespace senseloom::tool {
namespace {

constexpr char kTrace[] =
    R"({"format":1,"tool":"1.0.0","library":"/lib/libsenseloom.so.1","program":"/usr/bin/sensord","process":7301,"bits":32,"started":"2026-11-21T21:31:57.064729Z","clock":"CLOCK_MONOTONIC","part":1}
{"call":"open","session":"s1","sensor":"STAP","returned":"handle","atUs":5}
{"call":"open","session":"s2","sensor":"LIFT","returned":"handle","atUs":6}
{"call":"open","session":"s3","sensor":"LPE_P","returned":null,"atUs":6}
{"call":"set_option","session":"s1","option":"{}","returned":0,"atUs":7}
{"note":"lines missing here: 3","why":"No space left on device"}
{"call":"dispatch","session":"s1","record":{"hex":"05000000000000000100"},"returned":1,"atUs":8}
{"call":"dispatch","session":"s2","record":{"hex":"09000000000000000100"},"returned":1,"atUs":3723004000}
{"call":"close","session":"s1","returned":0,"atUs":3723004001}
{"end":7,"lost":3,"why":"No space left on device"}
)";

TEST(Info, TellsWhatATraceHoldsAndWhatIsLeftOpen) {
  const ToolRun run = runTool({"info", "-"}, kTrace);
  EXPECT_EQ(run.out,
            "trace: standard input\n"
            "program: /usr/bin/sensord\n"
            "process: 7301\n"
            "bits: 32\n"
            "library: /lib/libsenseloom.so.1\n"
            "tool: 1.0.0\n"
            "started: 2026-11-21T21:31:57.064729Z\n"
            "part: 1\n"
            "calls: 3 open, 1 set_option, 2 dispatch, 1 close\n"
            "notes: 1\n"
            "timestamps: 5 to 9\n"
            "duration: 1:02:03.004\n"
            "  sensor  sessions  options  records\n"
            "  STAP           1        1        1\n"
            "  LIFT           1        0        1\n"
            "standard input:10: 3 lines could not be recorded: No space left on device\n"
            "leak: session \"s2\" on LIFT, opened on line 3, is never closed\n");
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.status, 0);
}

// What is told of the calls that are wanted: behind "part", and without the remark.
std::string toldOf(std::vector<std::string> filter) {
  filter.insert(filter.begin(), {"info", "-"});
  const ToolRun run = runTool(filter, kTrace);
  EXPECT_EQ(run.status, 0) << run.err;
  std::string told = run.out.substr(run.out.find("calls: "));
  const std::string remark = "standard input:10: 3 lines could not be recorded: No space left on device\n";
  EXPECT_NE(told.find(remark), std::string::npos);
  return told.erase(told.find(remark), remark.size());
}

constexpr char kLeak[] = "leak: session \"s2\" on LIFT, opened on line 3, is never closed\n";

TEST(Info, TellsOfTheCallsThatAreWanted) {
  const std::string ofTapping =
      "calls: 1 open, 1 set_option, 1 dispatch, 1 close\n"
      "timestamps: 5 to 5\n"
      "duration: 1:02:03.003\n"
      "  sensor  sessions  options  records\n"
      "  STAP           1        1        1\n";
  EXPECT_EQ(toldOf({"--sensor", "STAP"}), ofTapping);
  EXPECT_EQ(toldOf({"--session", "s1"}), ofTapping);
  EXPECT_EQ(toldOf({"--from", "7", "--to", "3600s"}),
            "calls: 1 dispatch\n"
            "timestamps: 5 to 5\n"
            "duration: 0:00:00.000\n"
            "  sensor  sessions  options  records\n"
            "  STAP           1        0        1\n");
  EXPECT_EQ(toldOf({"--session", "s2", "--from", "8"}),
            "calls: 1 dispatch\n"
            "timestamps: 9 to 9\n"
            "duration: 0:00:00.000\n"
            "  sensor  sessions  options  records\n"
            "  LIFT           1        0        1\n" +
                std::string(kLeak));
  EXPECT_EQ(toldOf({"--failed"}),
            "calls: 1 open\n"
            "duration: 0:00:00.000\n"
            "  sensor  sessions  options  records\n");
}

constexpr char kToSensor[] = R"({"note":"x","timeUnit":"s"}
{"call":"open","session":"a","sensor":"STAP"}
{"call":"dispatch","sensor":"STAP","record":{"timestamp":1,"classes":1}}
{"call":"dispatch","sensor":"STAP","record":{"timestamp":91,"classes":1}}
)";

TEST(Info, CountsWhatIsDispatchedToAWholeSensorForTheSessionsOnIt) {
  const std::string ofA = R"("sensors":[{"sensor":"STAP","sessions":1,"options":0,"records":1}])";
  EXPECT_NE(runTool({"info", "--json", "--session", "a", "--from", "1s", "-"}, kToSensor).out.find(ofA),
            std::string::npos);
  EXPECT_NE(runTool({"info", "--json", "--session", "b", "-"}, kToSensor).out.find(R"("calls":"none","sensors":[])"),
            std::string::npos);
}

TEST(Info, CannotTellWhichCallsFailedWhereTheTraceDoesNot) {
  const ToolRun run = runTool({"info", "--failed", "-"}, kToSensor);
  EXPECT_EQ(run.err,
            "senseloom: standard input: --failed takes a recording: this trace does not tell what its calls returned, "
            "but \"senseloom replay --failed\" does\n");
  EXPECT_EQ(run.status, 2);
}

TEST(Info, PrintsJson) {
  const ToolRun run = runTool({"info", "--json", "-"}, kToSensor);
  EXPECT_EQ(run.out, R"({"trace":"standard input","calls":"1 open, 2 dispatch","notes":"1","timestamps":"1 to 91",)"
                     R"("duration":"0:01:30.000","sensors":[{"sensor":"STAP","sessions":1,"options":0,"records":2}],)"
                     R"("remarks":[],"leaks":[{"session":"a","sensor":"STAP","line":2}]})"
                     "\n");
}

// Two lists of s1 are released, one of them twice; of s2, only the list that it gave at the end.
constexpr char kLists[] = R"({"call":"open","session":"s1","sensor":"STAP"}
{"call":"open","session":"s2","sensor":"STAP"}
{"call":"set_option","session":"s1","option":{},"list":1}
{"call":"set_option","session":"s2","option":{},"list":2}
{"call":"release","list":1}
{"call":"set_option","session":"s1","option":{},"list":3}
{"call":"release","list":3}
{"call":"release","list":null}
{"call":"release","list":1}
{"call":"release","list":"unknown"}
{"call":"release","list":"unknown"}
{"call":"release","list":99}
{"call":"close","session":"s2","list":4}
{"call":"release","list":4}
{"call":"close","session":"s1"}
)";

TEST(Info, TellsListsThatAreNeverReleasedAndThoseReleasedWrongly) {
  const ToolRun run = runTool({"info", "-"}, kLists);
  EXPECT_EQ(run.out,
            "trace: standard input\n"
            "calls: 2 open, 3 set_option, 2 close\n"
            "lists: 4 given, 3 released\n"
            "  sensor  sessions  options  records\n"
            "  STAP           2        3        0\n"
            "standard input:9: list 1 is released once more\n"
            "standard input:10: a list is released that no recorded call gave, the first of 2 such releases\n"
            "leak: list 2, given to session \"s2\" by set_option on line 4, is never released\n");
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.status, 0);
  EXPECT_EQ(runTool({"info", "--json", "-"}, kLists).out,
            R"({"trace":"standard input","calls":"2 open, 3 set_option, 2 close","lists":"4 given, 3 released",)"
            R"("sensors":[{"sensor":"STAP","sessions":2,"options":3,"records":0}],)"
            R"("remarks":["standard input:9: list 1 is released once more","standard input:10: a list is released )"
            R"(that no recorded call gave, the first of 2 such releases"],"leaks":[],)"
            R"("listLeaks":[{"list":2,"session":"s2","call":"set_option","line":4}]})"
            "\n");
}

// A list is of the call that gave it, so a release without that call tells nothing.
TEST(Info, TellsTheListsOfTheWantedCalls) {
  const std::string told = runTool({"info", "--session", "s1", "-"}, kLists).out;
  EXPECT_NE(told.find("lists: 2 given, 2 released\n"), std::string::npos) << told;
  EXPECT_EQ(told.find("leak:"), std::string::npos) << told;
  const std::string other = runTool({"info", "--session", "s2", "-"}, kLists).out;
  EXPECT_NE(other.find("lists: 2 given, 1 released\n"), std::string::npos) << other;
  EXPECT_NE(other.find("leak: list 2, "), std::string::npos) << other;
}

TEST(Info, CountsTheListsBeyondTheFirstThatAreNeverReleased) {
  std::string trace = "{\"call\":\"open\",\"session\":\"a\",\"sensor\":\"STAP\"}\n";
  for (int list = 1; list <= 7; ++list) {
    trace += R"({"call":"set_option","session":"a","option":{},"list":)" + std::to_string(list) + "}\n";
  }
  const std::string told = runTool({"info", "-"}, trace + "{\"call\":\"close\",\"session\":\"a\"}\n").out;
  EXPECT_NE(told.find("leak: list 1, given to session \"a\" by set_option on line 2, is never released\n"),
            std::string::npos);
  const std::string rest = "on line 6, is never released\nleak: 2 more lists are never released\n";
  EXPECT_EQ(told.substr(told.size() - std::min(rest.size(), told.size())), rest);
}

TEST(Info, DoesNotCallATraceLeakyThatDoesNotTellOfReleases) {
  const ToolRun run = runTool({"info", "-"}, R"({"call":"open","session":"a","sensor":"STAP"}
{"call":"set_option","session":"a","option":"{}","returned":0,"properties":[]}
{"call":"close","session":"a"}
)");
  EXPECT_EQ(run.out.find("list"), std::string::npos) << run.out;
  EXPECT_EQ(run.out.find("leak"), std::string::npos) << run.out;
}

TEST(Info, ReportsBadInput) {
  const ToolRun run = runTool({"info", "README.md"});
  EXPECT_EQ(run.err.rfind("senseloom: README.md:1: not JSON: ", 0), 0U) << run.err;
  EXPECT_EQ(run.status, 2);
}

}  // namespace
}  // namespace senseloom::tool
