#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>

#include "sweep_support.h"

namespace senseloom::tool {
namespace {

// What the swept client gets when there are others, too.

// A record of class 1, at a time in seconds.
std::string record(int time, const std::string& session = "") {
  const std::string target = session.empty() ? R"("sensor":"PHYAC")" : R"("session":")" + session + '"';
  return R"({"call":"dispatch",)" + target + R"(,"record":{"timestamp":)" + std::to_string(1000 * time) +
         R"(,"items":[{"class":1,"seq":0}]}})" + '\n';
}

std::string open(const std::string& session) {
  return R"({"call":"open","sensor":"PHYAC","session":")" + session + "\"}\n";
}

std::string set(const std::string& session, const std::string& option) {
  return R"({"call":"set_option","session":")" + session + R"(","option":)" + option + "}\n";
}

std::string close(const std::string& session) {
  return R"({"call":"close","session":")" + session + "\"}\n";
}

// The number of results, of a trace that lasts an hour.
std::string resultsOf(const std::string& trace, const std::vector<std::string>& arguments) {
  std::vector<std::string> all{"--json"};
  all.insert(all.end(), arguments.begin(), arguments.end());
  const ToolRun run = sweepOf(trace, all);
  const std::string name = R"("results_per_hour":)";
  std::string numbers = run.err;
  std::istringstream lines(run.out);
  for (std::string line; std::getline(lines, line);) {
    const size_t at = line.find(name) + name.size();
    numbers += (numbers.empty() ? "" : " ") + line.substr(at, line.find(',', at) - at);
  }
  return numbers;
}

TEST(SweepReplay, KeepsWhatTheClientAskedForBesideTheSweptKeys) {
  const std::string trace =
      open("nav") + set("nav", R"({"logN":1,"mode":1})") + record(0) + record(1200) + record(2400) + record(3600);
  EXPECT_EQ(resultsOf(trace, {"--session", "nav", "--set", "mode=0,1"}), "2 1");
  EXPECT_NE(
      sweepOf(trace, {"--json", "--session", "nav", "--set", "mode=0"}).out.find(R"("option":{"logN":1,"mode":0})"),
      std::string::npos);
}

TEST(SweepReplay, GivesAClientThatAsksForNothingItsOptionAtOnce) {
  const std::string trace = open("nav") + record(0) + record(1800) + record(3600);
  EXPECT_EQ(resultsOf(trace, {"--session", "nav", "--set", "logN=0,1"}), "3 1");
}

TEST(SweepReplay, HasOthersNegotiateAsRecorded) {
  // A batch has 2 to the power of "logN" less the smallest "logM": one decision without the other, two with it.
  const std::string other = open("other") + set("other", R"({"logN":1,"logM":0})");
  const std::string records = record(0) + record(1200) + record(2400) + record(3600);
  const std::vector<std::string> arguments{"--sensor", "PHYAC", "--option", R"({"logM":1})", "--set", "logN=1"};
  EXPECT_EQ(resultsOf(records, arguments), "4");
  EXPECT_EQ(resultsOf(other + records, arguments), "2");
  // A batch that is cut off in the middle is never delivered.
  EXPECT_EQ(resultsOf(other + record(0) + close("other") + record(1200) + record(2400) + record(3600), arguments), "3");
}

TEST(SweepReplay, CountsARecordThatATraceHasOnceASessionOnce) {
  const std::string two = open("a") + open("b");
  const std::string records = record(0, "a") + record(0, "b") + record(3600, "a") + record(3600, "b");
  EXPECT_EQ(resultsOf(two + records, {"--sensor", "PHYAC", "--set", "logN=0"}), "2");
  // The session had that one already.
  EXPECT_EQ(resultsOf(two + records + record(3600, "b"), {"--sensor", "PHYAC", "--set", "logN=0"}), "3");
}

TEST(SweepReplay, LeavesOutTheTimeThatTheClientIsAway) {
  const std::string trace =
      open("nav") + record(0) + record(1800) + close("nav") + open("nav") + record(90000) + record(91800);
  EXPECT_EQ(resultsOf(trace, {"--session", "nav", "--set", "logN=0"}), "4");
}

TEST(SweepReplay, CrossesAnUninit) {
  // The client keeps its batch: the other one, opened later, negotiates on a sensor that it is no longer on.
  const std::string decisions = decisionsEach(1200, {{1, 1}, {1, 1}, {2, 2}, {2, 1}});
  const size_t last = decisions.rfind('\n', decisions.size() - 2) + 1;
  const std::string trace = open("nav") + decisions.substr(0, last) + "{\"call\":\"uninit\"}\n" + open("other") +
                            set("other", R"({"logN":3})") + decisions.substr(last);
  EXPECT_EQ(resultsOf(trace, {"--session", "nav", "--set", "logN=1"}), "2");
  // The second batch has both labels, so its class 2 is not false.
  EXPECT_NE(sweepOf(trace, {"--json", "--session", "nav", "--set", "logN=1"})
                .out.find(R"("reports_per_hour":1,"no_majority_per_hour":0,"false_per_hour":0,)"),
            std::string::npos);
}

TEST(SweepReplay, LetsASessionThatNeverOpenedBeOpenedAgain) {
  const std::string refused = R"({"call":"open","session":"other","sensor":"PHYAC","returned":null})"
                              "\n";
  EXPECT_EQ(resultsOf(refused + open("other") + record(0) + record(3600), {"--sensor", "PHYAC", "--set", "logN=0"}),
            "2");
}

TEST(SweepReplay, BeginsABatchWithTheFirstRecordThatAddsToIt) {
  const std::string empty = R"({"call":"dispatch","sensor":"PHYAC","record":{"timestamp":0,"items":[]}})"
                            "\n";
  const ToolRun run = sweepOf(empty + record(1200) + record(3600), {"--json", "--sensor", "PHYAC", "--set", "logN=1"});
  EXPECT_NE(run.out.find(R"("batch_median_s":2400})"), std::string::npos) << run.out;
}

TEST(SweepReplay, StartsEachCombinationOfGesturesAfresh) {
  // The engine's script goes on from record to record, and what was recognised last is kept in the process.
  const Environment script{{"SENSELOOM_GESTURE_SCRIPT", "gesture_hmm.script"}};
  const ToolRun run =
      runTool({"sweep", "gesture_hmm.jsonl", "--session", "dialer", "--set", "classMask=65535,1023,65535"}, "", script);
  std::istringstream lines(run.out);
  std::vector<std::string> rows(4);
  for (std::string& row : rows) std::getline(lines, row);
  EXPECT_EQ(rows[1], rows[3]) << run.out << run.err;
  EXPECT_NE(rows[1], rows[2]);
  // The digits are 2 records within 7 seconds, as in a replay.
  EXPECT_NE(rows[2].find("1028.6"), std::string::npos);
}

TEST(SweepReplay, HasTheGestureEngineAnswerAsRecorded) {
  const auto gesture = [](const char* session, int time, const std::string& engine) {
    return std::string(R"({"call":"dispatch","session":")") + session + R"(","record":{"timestamp":)" +
           std::to_string(1000 * time) + R"(,"prx":0,"samples":[[1,2,3,4,5,6]]})" + engine + "}\n";
  };
  const std::string letter = R"(,"engine":[{"group":0,"name":"LetterA "}])";
  // The first session's record is recognised, so that the second one's is not, or the other way round.
  const std::string trace = R"({"call":"open","sensor":"GSPX","session":"a"}
{"call":"open","sensor":"GSPX","session":"b"}
)" + gesture("a", 1, letter) +
                            gesture("b", 1, "") + gesture("b", 2, R"(,"engine":[])") + gesture("a", 2, "") +
                            gesture("a", 3601, letter) + gesture("b", 3601, "");
  for (const char* session : {"a", "b"}) {
    EXPECT_EQ(resultsOf(trace, {"--session", session, "--set", "classMask=1024,1"}), "2 0") << session;
  }
}

TEST(SweepReplay, EndsWhenASessionCannotBeOpened) {
  const ScratchFile modules("modules");
  std::filesystem::create_directory(modules.name);
  std::ofstream(modules.name + "/aware.primary.default.so") << "no library";
  const ToolRun run = runTool({"sweep", "audio_classification.jsonl", "--sensor", "LPE_P", "--set", "interval=1,2"}, "",
                              {{"SENSELOOM_HW_MODULE_PATH", modules.name}});
  std::filesystem::remove_all(modules.name);
  EXPECT_EQ(run.err, "senseloom: no session of LPE_P can be opened\n");
  EXPECT_EQ(run.status, 1);
}

}  // namespace
}  // namespace senseloom::tool
