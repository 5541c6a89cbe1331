#include <gtest/gtest.h>

#include <string>

#include "sweep_support.h"

namespace senseloom::tool {
namespace {

// What a sweep with bad input says. It ends with status 2, and prints nothing else.
std::string errorOf(const std::string& trace, const std::vector<std::string>& arguments) {
  const ToolRun run = sweepOf(trace, arguments);
  EXPECT_EQ(run.out, "");
  EXPECT_EQ(run.status, 2);
  return run.err;
}

const std::string kTrace = R"({"call":"open","session":"nav","sensor":"PHYAC"})"
                           "\n" +
                           decisionsEach(1, {{1}, {1}});

TEST(SweepErrors, NameAnArgument) {
  const auto errorWith = [](const std::string& set) { return errorOf(kTrace, {"--session", "nav", "--set", set}); };
  EXPECT_EQ(errorWith("logK=1"), "senseloom: --set logK: PHYAC has no key \"logK\"; the nearest is \"logN\"\n");
  EXPECT_EQ(errorWith("logN=3..1"), "senseloom: --set logN=3..1: the range \"3..1\" is empty\n");
  EXPECT_EQ(errorWith("logN="), "senseloom: --set logN=: no values\n");
  EXPECT_EQ(errorWith("logN"), "senseloom: --set logN: must be KEY=VALUES\n");
  EXPECT_EQ(errorWith("logN=1,"), "senseloom: --set logN=1,: \"\" is not an integer, nor a range such as 0..8\n");
  EXPECT_EQ(errorWith("logN=one"), "senseloom: --set logN=one: \"one\" is not an integer, nor a range such as 0..8\n");
  EXPECT_EQ(errorWith("logN=0..1000000"), "senseloom: --set logN=0..1000000: more than 1,000,000 values\n");
  EXPECT_EQ(errorOf(kTrace, {"--session", "nav", "--set", "logN=0..1000", "--set", "logM=0..999"}),
            "senseloom: more than 1,000,000 combinations: narrow the values of --set\n");
  EXPECT_EQ(errorOf(kTrace, {"--session", "nav", "--set", "logN=0", "--set", "logN=1"}),
            "senseloom: --set logN is there twice\n");
  EXPECT_EQ(errorOf(R"({"call":"dispatch","sensor":"DTWGS","record":{"timestamp":0,"classes":1}})",
                    {"--sensor", "DTWGS", "--set", "template1=1"}),
            "senseloom: --set template1: \"template1\" is not a key with integer values\n");
}

TEST(SweepErrors, SayWhichClientIsMissing) {
  EXPECT_EQ(errorOf("", {"--sensor", "STAP", "--set", "level=0"}),
            "senseloom: standard input: the trace is empty: there is no call in it\n"
            "senseloom: standard input: no record reaches sensor STAP\n");
  EXPECT_EQ(errorOf(kTrace, {"--session", "fit", "--set", "logN=0"}),
            "senseloom: standard input: no session \"fit\" is opened\n");
  EXPECT_EQ(errorOf(kTrace, {"--set", "logN=0"}),
            "senseloom: sweep needs --session NAME, or --sensor SENSOR for one more client\n");
  EXPECT_EQ(errorOf(kTrace, {"--sensor", "PHYSIC", "--set", "logN=0"}),
            "senseloom: unknown sensor \"PHYSIC\": the nearest is \"PHYAC\"; `senseloom sensors` prints all\n");
  EXPECT_EQ(errorOf(kTrace, {"--sensor", "PHYAC", "--option", "[]", "--set", "logN=0"}),
            "senseloom: the option [] is not a JSON object, so no key of it can be set\n");
}

TEST(SweepErrors, NameTheLineOfATrace) {
  const auto errorAt3 = [](const std::string& line) {
    return errorOf(R"({"call":"open","session":"nav","sensor":"PHYAC"}
{"call":"dispatch","session":"nav","record":{"timestamp":9,"items":[]}}
)" + line,
                   {"--session", "nav", "--set", "logN=0"});
  };
  const std::string start = "senseloom: standard input:3: ";
  EXPECT_EQ(errorAt3(R"({"call":"dispatch","session":"nav","record":{"timestamp":8,"items":[]}})"),
            start + "the timestamp 8 is before that of the record before\n");
  EXPECT_EQ(errorAt3(R"({"call":"dispatch","session":"nav","record":{"hex":"0900000000"}})"),
            start + "the record ends before its timestamp does\n");
  EXPECT_EQ(errorAt3(R"({"call":"dispatch","session":"nav","record":{"hex":"ffffffffffffffff0000"}})"),
            start + "the time 18446744073709551615 ms is beyond 292 years\n");
  EXPECT_EQ(errorAt3(R"({"call":"dispatch","session":"nav","record":{"timestamp":9,"items":[]},"truth":"on foot"})"),
            start + "\"truth\" must be the number of a class\n");
  EXPECT_EQ(errorAt3(R"({"call":"set_option","session":"nav","option":null})"),
            start + "the option null is not a JSON object, so no key of it can be set\n");
  EXPECT_EQ(errorAt3(R"({"call":"open","session":"nav","sensor":"PHYAC"})"),
            start + "session \"nav\" is already open\n");
  EXPECT_EQ(errorAt3(R"({"call":"close","session":"fit"})"), start + "no session \"fit\" is open\n");
  EXPECT_EQ(errorAt3(R"({"note":"","timeUnit":"min"})"),
            start + "unknown time unit \"min\": s, ms, us and ns are known\n");
  EXPECT_EQ(errorAt3("{}"), start + "missing \"call\"\n");
}

TEST(SweepErrors, NameTheLineOfATruthFile) {
  const auto errorWith = [](const std::string& table) {
    const ScratchFile truth("bad_truth");
    write(truth, table);
    const std::string error = errorOf(kTrace, {"--session", "nav", "--set", "logN=0", "--truth", truth.name});
    return error.substr(error.find(truth.name) + truth.name.size());
  };
  EXPECT_EQ(errorWith("time,class\n1,1\n1\n"), ":3: must hold a time and a class\n");
  EXPECT_EQ(errorWith("5,1\n4,1\n"), ":2: the time is before that of the row above\n");
  EXPECT_EQ(errorWith("5,sitting\n"), ":1: \"sitting\" is not the number of a class\n");
  EXPECT_EQ(errorWith("5,1\n1e3,2\n"), ":2: \"1e3\" is not a time: a number such as 12 or 3.84\n");
  EXPECT_EQ(errorWith("5,\"1\n"), ":1: a double quote is not closed\n");
  EXPECT_EQ(errorWith("time,class\n"), ":1: holds no truth\n");
  EXPECT_EQ(errorOf(kTrace, {"--session", "nav", "--set", "logN=0", "--truth", "a", "--truth", "b"}),
            "senseloom: --truth is needed once for each trace: 1 times, not 2\n");
}

TEST(SweepErrors, NameWhatCannotBeShown) {
  const std::vector<std::string> client{"--session", "nav", "--set", "logN=0"};
  const auto errorWith = [&](std::vector<std::string> more) {
    more.insert(more.begin(), client.begin(), client.end());
    return errorOf(kTrace, more);
  };
  EXPECT_EQ(errorWith({"--sort", "delay"}).find("senseloom: no figure \"delay\": results_per_hour, "), 0U);
  EXPECT_EQ(errorWith({"--at-most-false", "2"}),
            "senseloom: a recommendation takes true classes, which neither the traces nor --truth tell\n");
  EXPECT_EQ(errorWith({"--at-most-delay", "5 min"}),
            "senseloom: unknown time unit \"min\": s, ms, us and ns are known\n");
  EXPECT_EQ(errorWith({"--time-unit", "h"}), "senseloom: unknown time unit \"h\": s, ms, us and ns are known\n");
  EXPECT_EQ(errorOf(R"({"call":"dispatch","sensor":"PDR","record":{"timestamp":0,"items":[]}})",
                    {"--sensor", "PDR", "--set", "N=0", "--plot", "/dev/null"}),
            "senseloom: the results of PDR have no classes to draw reports of\n");
}

}  // namespace
}  // namespace senseloom::tool
