#include <gtest/gtest.h>

#include <string>

#include "sweep_support.h"

namespace senseloom::tool {
namespace {

// All traces here last an hour, so that a rate is a number. The expectations are computed by hand.

TEST(SweepFigures, CountResultsReportsAndWhatIsFalse) {
  // Reports: 2, 6, 1. False: 2. Right in the first two of four quarters.
  EXPECT_EQ(figuresOf(decisionsEach(900, {{1, 1}, {1, 1}, {2, 1}, {6, 1}, {1, 1}}), "logN=0"),
            R"({"option":{"logN":0},"results_per_hour":5,"reports_per_hour":3,"no_majority_per_hour":1,)"
            R"("false_per_hour":1,"changes":0,"missed":0,"delay_median_s":null,"delay_p90_s":null,"right":0.5})"
            "\n");
}

TEST(SweepFigures, CountATieAsAResultWithoutAMajority) {
  // Results: 6 at 720 s, 2 at 2160 s, 1 at 3600 s. Changes at 720 s and 2880 s. Right from 2160 s to 2880 s.
  EXPECT_EQ(figuresOf(decisionsEach(720, {{1, 1}, {2, 2}, {2, 2}, {2, 2}, {1, 1}, {1, 1}}), "logN=1"),
            R"({"option":{"logN":1},"results_per_hour":3,"reports_per_hour":2,"no_majority_per_hour":1,)"
            R"("false_per_hour":0,"changes":2,"missed":0,"delay_median_s":1080,"delay_p90_s":1440,"right":0.2})"
            "\n");
}

TEST(SweepFigures, LetUnlabelledRecordsBetweenTwoOfALabelBeAGapInIt) {
  // Changes at 1200 s, heard at 2400 s, and at 3000 s, heard at 3600 s. Right for two of four labelled sixths.
  EXPECT_EQ(figuresOf(decisionsEach(600, {{1, 1}, {1}, {1, 2}, {1}, {2, 2}, {2, 3}, {3, 3}}), "logN=0"),
            R"({"option":{"logN":0},"results_per_hour":7,"reports_per_hour":2,"no_majority_per_hour":0,)"
            R"("false_per_hour":0,"changes":2,"missed":0,"delay_median_s":900,"delay_p90_s":1200,"right":0.5})"
            "\n");
}

TEST(SweepFigures, MissAChangeWhoseLabelEndsBeforeTheClassArrives) {
  // Label 2 lasts from 1200 s to 1800 s. Class 2 comes at 2400 s, where nothing is labelled.
  EXPECT_EQ(figuresOf(decisionsEach(600, {{1, 1}, {1, 1}, {1, 2}, {1, 2}, {2}, {2}, {2}}), "logN=0"),
            R"({"option":{"logN":0},"results_per_hour":7,"reports_per_hour":1,"no_majority_per_hour":0,)"
            R"("false_per_hour":0,"changes":1,"missed":1,"delay_median_s":null,"delay_p90_s":null,"right":0.5})"
            "\n");
}

TEST(SweepFigures, TakeNoTimeForAChangeThatTheClientWasToldBefore) {
  // On change, nothing is delivered with the last record: the client believes in class 2 since 1800 s.
  EXPECT_EQ(figuresOf(decisionsEach(1800, {{1, 1}, {2, 1}, {2, 2}}), "mode=1"),
            R"({"option":{"mode":1},"results_per_hour":2,"reports_per_hour":1,"no_majority_per_hour":0,)"
            R"("false_per_hour":1,"changes":1,"missed":0,"delay_median_s":0,"delay_p90_s":0,"right":0.5})"
            "\n");
}

TEST(SweepFigures, TakeAReportForFalseOnlyWhenItsWholeBatchIsLabelled) {
  const std::string labelled = figuresOf(decisionsEach(1200, {{1, 1}, {1, 1}, {2, 1}, {2, 1}}), "logN=1");
  EXPECT_NE(labelled.find(R"("false_per_hour":1)"), std::string::npos) << labelled;
  const std::string inPart = figuresOf(decisionsEach(1200, {{1, 1}, {1, 1}, {2, 1}, {2}}), "logN=1");
  EXPECT_NE(inPart.find(R"("reports_per_hour":1,"no_majority_per_hour":0,"false_per_hour":0)"), std::string::npos)
      << inPart;
}

TEST(SweepFigures, LookAtTheLabelsOfTheReportsOwnBatchAlone) {
  // The batch with label 2 is not delivered, since it says nothing new, and is not part of the one after it.
  const std::string figures =
      figuresOf(decisionsEach(720, {{1, 1}, {1, 1}, {1, 2}, {1, 2}, {2, 1}, {2, 1}}), "logN=1", R"({"mode":1})");
  EXPECT_NE(figures.find(R"({"option":{"mode":1,"logN":1},"results_per_hour":2,"reports_per_hour":1,)"
                         R"("no_majority_per_hour":0,"false_per_hour":1,)"),
            std::string::npos)
      << figures;
}

TEST(SweepFigures, TakeFor90PercentTheDelayThatNineOfTenDoNotExceed) {
  std::vector<Decided> decisions;
  for (int i = 0; i < 22; ++i) decisions.push_back({1 + i / 2 % 2, 1 + i / 2 % 2});
  decisions[20].classNumber = decisions[19].classNumber;  // one of ten changes is heard a second late
  const std::string figures = figuresOf(decisionsEach(1, decisions), "logN=0");
  EXPECT_NE(figures.find(R"("changes":10,"missed":0,"delay_median_s":0,"delay_p90_s":0,)"), std::string::npos)
      << figures;
  decisions[18].classNumber = decisions[17].classNumber;
  EXPECT_NE(figuresOf(decisionsEach(1, decisions), "logN=0").find(R"("delay_median_s":0,"delay_p90_s":1,)"),
            std::string::npos);
}

TEST(SweepFigures, AreUnknownWhereOneRecordLeavesNoTime) {
  EXPECT_EQ(figuresOf(decisionsEach(1, {{1, 1}}), "logN=0"),
            R"({"option":{"logN":0},"results_per_hour":null,"reports_per_hour":null,"no_majority_per_hour":null,)"
            R"("false_per_hour":null,"changes":0,"missed":0,"delay_median_s":null,"delay_p90_s":null,"right":null})"
            "\n");
}

TEST(SweepFigures, WithoutTruthTellHowLongABatchTakes) {
  EXPECT_EQ(figuresOf(decisionsEach(1200, {{1}, {1}, {2}, {2}}), "logN=1"),
            R"({"option":{"logN":1},"results_per_hour":2,"reports_per_hour":1,"no_majority_per_hour":0,)"
            R"("false_per_hour":null,"changes":null,"missed":null,"delay_median_s":null,"delay_p90_s":null,)"
            R"("right":null,"batch_median_s":1200})"
            "\n");
}

TEST(SweepFigures, AreOfSeveralTracesEachFromItsStart) {
  const ScratchFile first("first_trace");
  const ScratchFile second("second_trace");
  write(first, decisionsEach(900, {{1, 1}, {1, 1}, {1, 1}}));   // half an hour
  write(second, decisionsEach(900, {{2, 2}, {2, 2}, {3, 2}}));  // its first result is no report, and 2 no change
  const ToolRun run = runTool({"sweep", first.name, second.name, "--json", "--sensor", "PHYAC", "--set", "logN=0"});
  EXPECT_EQ(run.out, R"({"option":{"logN":0},"results_per_hour":6,"reports_per_hour":1,"no_majority_per_hour":0,)"
                     R"("false_per_hour":1,"changes":0,"missed":0,"delay_median_s":null,"delay_p90_s":null,"right":1})"
                     "\n");
}

TEST(SweepFigures, TakeTheTruthFromAFile) {
  const ScratchFile truth("truth");
  // In milliseconds, as the trace. Nothing is known before 720 s, nor from 2880 s on.
  write(truth, "time,class\n720000,1\n1440000,2\n2880000,0\n");
  const ToolRun run = sweepOf(decisionsEach(720, {{1, 5}, {1, 5}, {1, 5}, {2, 5}, {2, 5}, {2, 5}}),
                              {"--json", "--sensor", "PHYAC", "--set", "logN=0", "--truth", truth.name});
  // Right from 720 s to 1440 s and from 2160 s to 2880 s, of 2160 s.
  EXPECT_EQ(run.out,
            R"({"option":{"logN":0},"results_per_hour":6,"reports_per_hour":1,"no_majority_per_hour":0,)"
            R"("false_per_hour":0,"changes":1,"missed":0,"delay_median_s":720,"delay_p90_s":720,"right":0.6666666667})"
            "\n");
}

TEST(SweepFigures, ReadATruthFileInTheUnitOfTheTrace) {
  const ScratchFile truth("truth_in_microseconds");
  write(truth, "1800000,2\n");  // behind the only slip
  const std::string trace = R"({"note":"","timeUnit":"us"})"
                            "\n" +
                            decisionsEach(1200, {{1}, {2}, {2}, {2}});
  EXPECT_NE(sweepOf(trace, {"--json", "--sensor", "PHYAC", "--set", "logN=0", "--truth", truth.name})
                .out.find(R"("right":1})"),
            std::string::npos);
}

TEST(SweepFigures, CountTimeInTheUnitOfTheTraceOrOfTheOption) {
  const std::string trace = R"({"note":"each second","timeUnit":"us"})"
                            "\n" +
                            decisionsEach(3600, {{1}, {1}});
  const auto rateOf = [&](const std::vector<std::string>& more) {
    std::vector<std::string> arguments{"--json", "--sensor", "PHYAC", "--set", "logN=0"};
    arguments.insert(arguments.end(), more.begin(), more.end());
    const std::string out = sweepOf(trace, arguments).out;
    const std::string name = "\"results_per_hour\":";
    const size_t at = out.find(name) + name.size();
    return out.substr(at, out.find(',', at) - at);
  };
  EXPECT_EQ(rateOf({}), "2000");
  EXPECT_EQ(rateOf({"--time-unit", "s"}), "0.002");
  EXPECT_EQ(rateOf({"--time-unit", "ns"}), "2000000");
}

TEST(SweepFigures, HaveNoReportsWhereResultsHaveNoClasses) {
  const ToolRun run = runTool({"sweep", "step_count.jsonl", "--json", "--sensor", "SCOUN", "--set", "mode=1"});
  EXPECT_NE(run.out.find(R"("reports_per_hour":null,"no_majority_per_hour":null,"false_per_hour":null)"),
            std::string::npos)
      << run.out;
}

TEST(SweepFigures, TakeClass6OfOtherSensorsForAnyClass) {
  // The mask leaves class 6 alone: the third and the last record. Its label is 5 at first.
  const ToolRun run = sweepOf(R"({"call":"dispatch","sensor":"GSFLK","record":{"timestamp":0,"class":5},"truth":5}
{"call":"dispatch","sensor":"GSFLK","record":{"timestamp":1200000,"class":6},"truth":5}
{"call":"dispatch","sensor":"GSFLK","record":{"timestamp":2400000,"class":5},"truth":5}
{"call":"dispatch","sensor":"GSFLK","record":{"timestamp":3600000,"class":6},"truth":6}
)",
                              {"--json", "--sensor", "GSFLK", "--set", "classMask=63,32"});
  EXPECT_EQ(run.out,
            R"({"option":{"classMask":63},"results_per_hour":4,"reports_per_hour":3,"no_majority_per_hour":0,)"
            R"("false_per_hour":1,"changes":1,"missed":0,"delay_median_s":0,"delay_p90_s":0,"right":0.6666666667})"
            "\n"
            R"({"option":{"classMask":32},"results_per_hour":2,"reports_per_hour":0,"no_majority_per_hour":0,)"
            R"("false_per_hour":0,"changes":1,"missed":0,"delay_median_s":0,"delay_p90_s":0,"right":0})"
            "\n");
}

}  // namespace
}  // namespace senseloom::tool
