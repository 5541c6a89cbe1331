#include <gtest/gtest.h>

#include <cctype>
#include <string>

#include "sweep_support.h"

namespace senseloom::tool {
namespace {

// An hour with one change after 30 minutes, and a slip of the classifier before it and after it. In batches of two: 1,
// 6, 1, 2, 6, 2, and half of one. In batches of four: 1, 6, 2.
const std::string kHour = decisionsEach(
    300, {{1, 1}, {1, 1}, {1, 1}, {2, 1}, {1, 1}, {1, 1}, {2, 2}, {2, 2}, {2, 2}, {1, 2}, {2, 2}, {2, 2}, {2, 2}});

ToolRun sweepTrace(std::vector<std::string> more) {
  more.insert(more.begin(), {"--sensor", "PHYAC", "--option", R"({"mode":1})"});
  return sweepOf(kHour, more);
}

TEST(SweepOutput, IsATableWithARowACombination) {
  EXPECT_EQ(
      sweepTrace({"--set", "logN=0..1", "--set", "weightVar=-1"}).out,
      "  logN  weightVar  results/h  reports/h  no majority/h  false/h  changes  missed  delay s  90 % s  right\n"
      "     0         -1        6.0        5.0            0.0      2.0        1       0      0.0     0.0  0.833\n"
      "     1         -1        6.0        5.0            2.0      0.0        1       0    300.0   300.0  0.500\n");
}

TEST(SweepOutput, IsSortedAndCut) {
  const auto firstsOf = [](const std::vector<std::string>& more) {
    std::vector<std::string> arguments{"--set", "logN=0..2", "--json"};
    arguments.insert(arguments.end(), more.begin(), more.end());
    const ToolRun run = sweepTrace(arguments);
    std::string firsts = run.err;
    for (size_t at = 0; (at = run.out.find("\"logN\":", at)) != std::string::npos;) firsts += run.out[at += 7];
    return firsts;
  };
  EXPECT_EQ(firstsOf({}), "012");
  EXPECT_EQ(firstsOf({"--reverse"}), "210");
  EXPECT_EQ(firstsOf({"--sort", "reports_per_hour"}), "201");
  EXPECT_EQ(firstsOf({"--sort", "right", "--reverse"}), "012");
  EXPECT_EQ(firstsOf({"--sort", "reports_per_hour", "--limit", "2"}), "20");
  EXPECT_EQ(firstsOf({"--limit", "0"}), "");
  // 4 decisions miss nothing that 2 hear, but later.
  EXPECT_EQ(firstsOf({"--best"}), "01");
}

TEST(SweepOutput, RecommendsWithinLimits) {
  const auto lineOf = [](const std::vector<std::string>& more) {
    std::vector<std::string> arguments{"--set", "logN=0..1", "--limit", "0"};
    arguments.insert(arguments.end(), more.begin(), more.end());
    return sweepTrace(arguments).out;
  };
  const std::string one =
      "take {\"mode\":1,\"logN\":0}: 2.0 false reports an hour, a median delay of 0.0 s, 0 of 1 changes missed, right "
      "for "
      "83.3 % of the time.\n";
  const std::string two =
      "take {\"mode\":1,\"logN\":1}: 0.0 false reports an hour, a median delay of 300.0 s, 0 of 1 changes missed, "
      "right "
      "for 50.0 % of the time.\n";
  EXPECT_EQ(lineOf({"--at-most-false", "2"}), "With at most 2.0 false reports an hour, " + one);
  EXPECT_EQ(lineOf({"--at-most-false", "1.9"}), "With at most 1.9 false reports an hour, " + two);
  EXPECT_EQ(lineOf({"--at-most-delay", "300s"}), "With a median delay of at most 300.0 s, " + two);
  EXPECT_EQ(lineOf({"--at-most-delay", "299999 ms"}), "With a median delay of at most 300.0 s, " + one);
  EXPECT_EQ(lineOf({"--at-most-false", "1", "--at-most-delay", "5"}),
            "No combination has at most 1.0 false reports an hour and a median delay of at most 5.0 s.\n");
}

TEST(SweepOutput, MarksRowsWithValuesThatAreReplaced) {
  const ToolRun run = sweepTrace({"--set", "logN=0,9", "--json"});
  EXPECT_EQ(run.out.find("replaced"), run.out.find(R"(replaced":["\"logN\" 9 becomes 8"]})"));
  EXPECT_EQ(run.err,
            "senseloom: 1 of 2 combinations have a value that is replaced or refused:\n  \"logN\" 9 becomes 8\n");
  EXPECT_EQ(run.status, 2);
  const std::string table = sweepTrace({"--set", "logN=0,9"}).out;
  EXPECT_EQ(table.find('!'), table.size() - 2) << table;
  // A value that comes to what is asked for is none.
  EXPECT_EQ(sweepTrace({"--set", "weightVar=-1,0"}).status, 0);
}

TEST(SweepOutput, NamesWhatIsReplacedOrRefused) {
  const auto errorOf = [](const char* sensor, const std::vector<std::string>& sets) {
    const std::string trace =
        std::string(R"({"call":"dispatch","sensor":")") + sensor + R"(","record":{"timestamp":0,"classes":1}})";
    std::vector<std::string> arguments{"--sensor", sensor};
    for (const std::string& each : sets) arguments.insert(arguments.end(), {"--set", each});
    const ToolRun run = sweepOf(trace, arguments);
    EXPECT_EQ(run.status, 2);
    return run.err.substr(run.err.find('\n') + 1);
  };
  EXPECT_EQ(errorOf("STAP", {"level=6"}), "  \"classMask\" 3 becomes 0\n");
  EXPECT_EQ(errorOf("STAP", {"classMask=4294967297"}), "  \"classMask\" 4294967297 becomes 1\n");
  EXPECT_EQ(errorOf("DTWGS", {"mode=4", "classMask=5"}),
            "  the option is refused: \"classMask\" 5 is not in 1..3: the whole option is refused\n");
}

TEST(SweepOutput, DrawsWhatNoOtherBeats) {
  const ScratchFile picture("sweep.svg");
  EXPECT_EQ(sweepTrace({"--set", "logN=0..2", "--set", "weightVar=-1,11", "--plot", picture.name}).status, 0);
  const std::string svg = contentOf(picture.name);
  EXPECT_NE(svg.find("<title>PHYAC: 6 combinations</title>"), std::string::npos);
  EXPECT_NE(svg.find(">false reports an hour</text>"), std::string::npos);
  EXPECT_NE(svg.find(">logN 0, weightVar -1 (+1 alike)</text>"), std::string::npos);
  EXPECT_NE(svg.find(">logN 1, weightVar -1 (+1 alike)</text>"), std::string::npos);
  EXPECT_EQ(svg.find(">logN 2"), std::string::npos);
  for (const char* foreign : {"<script", "href", "url(", "@import"}) EXPECT_EQ(svg.find(foreign), std::string::npos);
}

TEST(SweepOutput, DrawsReportsWhereTheTruthIsNotKnown) {
  const ScratchFile picture("sweep_without_truth.svg");
  const ToolRun run =
      runTool({"sweep", "commute.jsonl", "--session", "nav", "--set", "logN=0..3", "--plot", picture.name});
  EXPECT_EQ(run.status, 0);
  EXPECT_NE(contentOf(picture.name).find(">reports an hour (what is true is not known)</text>"), std::string::npos);
}

// Words between single blanks, without the marks of a list.
std::string wordsOf(const std::string& text) {
  std::string words;
  for (const char c : text) {
    const bool isBlank = std::isspace(static_cast<unsigned char>(c)) != 0;
    if (!isBlank) words += c;
    if (isBlank && !words.empty() && words.back() != ' ') words += ' ';
  }
  for (size_t at; (at = words.find(" - ")) != std::string::npos;) words.erase(at, 2);
  return words;
}

TEST(SweepOutput, IsDefinedAlikeInTheHelpAndInTheDocumentation) {
  const std::string help = wordsOf(runTool({"sweep", "--help"}).out);
  const size_t begin = help.find("An hour is");
  const size_t end = help.find("Where the truth is");
  ASSERT_LT(begin, end);
  ASSERT_NE(end, std::string::npos);
  EXPECT_NE(wordsOf(contentOf(EXAMPLES_FOLDER "/../docs/choosing-options.md")).find(help.substr(begin, end - begin)),
            std::string::npos);
}

}  // namespace
}  // namespace senseloom::tool
