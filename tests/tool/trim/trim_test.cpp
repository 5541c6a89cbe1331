#include <gtest/gtest.h>

#include <fstream>
#include <string>

#include "recording.h"

namespace senseloom::tool {
namespace {

const std::string kOpenA = R"({"call":"open","session":"a","sensor":"PHYAC","returned":"handle","atUs":10})"
                           "\n";
const std::string kOpenB = R"({"call":"open","session":"b","sensor":"PHYAC","returned":"handle","atUs":20})"
                           "\n";
const std::string kOpenC = R"({"call":"open","session":"c","sensor":"LIFT","returned":"handle","atUs":30})"
                           "\n";
const std::string kHead = R"({"format":1,"started":"2026-11-21T21:31:57.000000Z","clock":"CLOCK_MONOTONIC"})"
                          "\n";
const std::string kNote = "{\"note\":\"in the middle\"}\n";

std::string dispatch(const std::string& session, int second) {
  return R"({"call":"dispatch","session":")" + session +
         R"(","record":{"hex":"000000000000000001000000"},"returned":0,"atUs":)" + std::to_string(second * 1000000) +
         "}\n";
}
const std::string kTrace = kHead + kOpenA + kOpenB + kOpenC + dispatch("a", 1) + dispatch("b", 2) + kNote +
                           dispatch("c", 3) + dispatch("a", 4) + R"({"call":"close","session":"a","atUs":5000000})" +
                           "\n" + R"({"end":8,"lost":0})" + "\n";

std::string trimmed(std::vector<std::string> arguments, const std::string& text = kTrace) {
  const ScratchFile trace("whole_trace");
  std::ofstream(trace.name) << text;
  arguments.insert(arguments.begin(), {"trim", trace.name});
  const ToolRun run = runTool(arguments);
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.status, 0);
  return run.out;
}

TEST(Trim, KeepsTheRecordsOfASessionAndWhatTheyNeed) {
  EXPECT_EQ(trimmed({"--session", "b"}), kHead + kOpenA + kOpenB + dispatch("b", 2) + kNote +
                                             R"({"call":"close","session":"a","atUs":5000000})" +
                                             "\n{\"end\":4,\"lost\":0}\n");
}

TEST(Trim, KeepsTheRecordsOfASensor) {
  EXPECT_EQ(trimmed({"--sensor", "LIFT"}), kHead + kOpenC + kNote + dispatch("c", 3) + "{\"end\":2,\"lost\":0}\n");
}

TEST(Trim, CutsByTimeAndLineAndMarksSessionsThatWereOpenBefore) {
  const std::string resumed =
      R"({"call":"open","session":"a","sensor":"PHYAC","returned":"handle","atUs":10,"resumed":1})"
      "\n";
  const auto expectPart = [&](const std::string& part) {
    EXPECT_EQ(part.substr(0, kHead.size() + resumed.size()), kHead + resumed);
    // What a had gathered, without its outcome.
    const std::string gathered =
        R"({"call":"dispatch","session":"a","record":{"hex":"000000000000000001000000"},"atUs":1000000})"
        "\n";
    EXPECT_NE(part.find(gathered + dispatch("b", 2) + kNote + dispatch("c", 3) + "{\"end\":6,"), std::string::npos)
        << part;
    EXPECT_EQ(part.find("close"), std::string::npos);
  };
  expectPart(trimmed({"--from", "2s", "--to", "3s"}));
  expectPart(trimmed({"--from", "6", "--to", "8"}));
}

// Also behind the part, so that a list of it does not look like one that is never released.
TEST(Trim, KeepsTheReleasesOfListsThatKeptCallsGave) {
  const std::string open = R"({"call":"open","session":"a","sensor":"LIFT"})"
                           "\n";
  const std::string other = R"({"call":"open","session":"b","sensor":"STAP"})"
                            "\n";
  const auto set = [](const std::string& session, int list) {
    return R"({"call":"set_option","session":")" + session + R"(","option":{},"list":)" + std::to_string(list) + "}\n";
  };
  const auto release = [](const std::string& list) { return R"({"call":"release","list":)" + list + "}\n"; };
  const std::string trace = open + other + set("a", 1) + release("1") + set("b", 2) + release("2") + set("a", 3) +
                            release("null") + set("a", 4) + release("3") + release("4") + release("\"unknown\"");
  const auto part = [&](std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), {"trim", "-"});
    return runTool(arguments, trace).out;
  };
  EXPECT_EQ(part({"--sensor", "LIFT", "--to", "8"}),
            open + set("a", 1) + release("1") + set("a", 3) + release("null") + release("3") + release("\"unknown\""));
  EXPECT_EQ(part({"--sensor", "STAP"}), other + set("b", 2) + release("2") + release("null") + release("\"unknown\""));
}

TEST(Trim, KeepsTheCallsThatFailedAndWhatTheyNeed) {
  const std::string refused = R"({"call":"dispatch","session":"c","record":{"hex":""},"returned":-1,"atUs":2000000})"
                              "\n";
  const std::string trace =
      kHead + kOpenA + kOpenC + dispatch("a", 1) + refused + dispatch("c", 3) + kNote + "{\"end\":5,\"lost\":0}\n";
  EXPECT_EQ(trimmed({"--failed"}, trace), kHead + kOpenC + refused + kNote + "{\"end\":2,\"lost\":0}\n");
  const ScratchFile recording("refused");
  std::ofstream(recording.name) << trace;
  for (const std::vector<std::string>& none : {std::vector<std::string>{"--session", "a"}, {"--from", "3s"}}) {
    std::vector<std::string> arguments{"trim", recording.name, "--failed"};
    arguments.insert(arguments.end(), none.begin(), none.end());
    EXPECT_EQ(runTool(arguments).err, "senseloom: " + recording.name + ": none of the calls failed\n");
  }
}

TEST(Trim, MakesAPartThatReplaysAsRecorded) {
  const ScratchFile recording("recording");
  ASSERT_EQ(recordTo(recording.name, {TOOL_FILE, "replay", "--quiet", "commute.jsonl"}).status, 0);
  for (const std::vector<std::string>& part :
       {std::vector<std::string>{"--session", "s2"}, {"--from", "1000", "--to", "1700"}}) {
    const ScratchFile file("part");
    std::vector<std::string> arguments{"trim", recording.name, "-o", file.name};
    arguments.insert(arguments.end(), part.begin(), part.end());
    EXPECT_EQ(runTool(arguments).err, "");
    const ToolRun checked = check(file.name);
    EXPECT_EQ(checked.status, 0) << checked.out << checked.err;
  }
}

// Two sessions get each record. The second one's is not recognised anew.
TEST(Trim, KeepsWhatTheGestureEngineAnsweredWithTheFirstSessionThatIsKept) {
  const std::string open = R"({"call":"open","session":"a","sensor":"GSPX"}
{"call":"open","session":"b","sensor":"GSPX"}
)";
  const auto gesture = [](const char* session, int time, const std::string& engine) {
    return std::string(R"({"call":"dispatch","session":")") + session + R"(","record":{"timestamp":)" +
           std::to_string(time) + R"(,"prx":0,"samples":[[1,2,3,4,5,6]]})" + engine + "}\n";
  };
  const std::string one = R"(,"engine":[{"group":0,"name":"NumberOne "}])";
  const std::string none = R"(,"engine":[])";
  const std::string trace = open + gesture("a", 1, one) + gesture("b", 1, "") + gesture("a", 2, none) +
                            gesture("b", 2, "") + gesture("b", 2, "") + gesture("b", 3, "");
  EXPECT_EQ(runTool({"trim", "-"}, trace).out, trace);
  const ScratchFile file("gestures");
  std::ofstream(file.name) << trace;
  EXPECT_EQ(runTool({"trim", "--session", "b", file.name}).out,
            open + gesture("b", 1, one) + gesture("b", 2, none) + gesture("b", 2, "") + gesture("b", 3, ""));
  EXPECT_EQ(runTool({"trim", "--from", "6", file.name}).out,
            open + gesture("b", 2, none) + gesture("b", 2, "") + gesture("b", 3, ""));
}

TEST(Trim, OverwritesNothing) {
  const ScratchFile file("kept");
  std::ofstream(file.name) << "kept";
  const ToolRun run = runTool({"trim", "lift.jsonl", "-o", file.name});
  EXPECT_EQ(run.err, "senseloom: " + file.name + ": holds something already\n");
  EXPECT_EQ(run.status, 2);
  EXPECT_EQ(contentOf(file.name), "kept");
}

TEST(Trim, ReportsWhatItCannotDo) {
  const std::string readTwice = "senseloom: standard input cannot be read twice, as --session and --failed take\n";
  EXPECT_EQ(runTool({"trim", "-", "--session", "a"}).err, readTwice);
  EXPECT_EQ(runTool({"trim", "-", "--failed"}).err, readTwice);
  EXPECT_EQ(runTool({"trim", "lift.jsonl", "--failed"}).err,
            "senseloom: lift.jsonl: --failed takes a recording: this trace does not tell what its calls returned, but "
            "\"senseloom replay --failed\" does\n");
  EXPECT_EQ(runTool({"trim", "lift.jsonl", "--session", "none"}).err,
            "senseloom: lift.jsonl: no session of that name is opened\n");
  EXPECT_EQ(runTool({"trim", "lift.jsonl", "--session", "none"}).status, 2);
}

}  // namespace
}  // namespace senseloom::tool
