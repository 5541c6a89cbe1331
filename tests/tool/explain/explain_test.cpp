#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <fstream>
#include <string>

#include "run_tool.h"

namespace senseloom::tool {
namespace {

// The whole output for an example, as it was checked by hand; that of the commute also against a model in another
// language.
class ExplainedExample : public testing::TestWithParam<const char*> {};

TEST_P(ExplainedExample, IsAsExpected) {
  const ToolRun run = runTool({"explain", "--records", std::string(GetParam()) + ".jsonl"}, "",
                              {{"SENSELOOM_GESTURE_SCRIPT", "gesture_hmm.script"}});
  EXPECT_EQ(run.out, contentOf(std::string(GOLDEN_FOLDER "/explain/") + GetParam() + ".txt"));
  EXPECT_EQ(run.status, 0);
}

INSTANTIATE_TEST_SUITE_P(EverySensor, ExplainedExample,
                         testing::Values("tapping", "gesture_flick", "shaking", "instant_activity", "step_count",
                                         "gesture_hmm", "dtwgs", "gesture_eartouch", "audio_classification", "pdr",
                                         "lift"),
                         [](const auto& example) { return std::string(example.param); });

TEST(ExplainedCommute, IsAsExpected) {
  const ToolRun run = runTool({"explain", "commute.jsonl"});
  EXPECT_EQ(run.out, contentOf(GOLDEN_FOLDER "/explain/commute.txt"));
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.status, 0);
}

TEST(ExplainTrace, LeavesNothingUnexplainedOverManySeeds) {
  for (const char* seed : {"1", "2", "3", "4", "5"}) {
    const std::string trace = runTool({"generate", "commute", "--seed", seed}).out;
    const ToolRun run = runTool({"explain", "-"}, trace);
    EXPECT_EQ(run.out.find("unexplained"), std::string::npos) << seed;
    EXPECT_EQ(run.status, 0);
  }
}

TEST(ExplainTrace, CountsSessionsThatStayOpenButNegotiatesNoMore) {
  const ToolRun run = runTool({"explain", "-"}, R"({"call":"open","session":"a","sensor":"PHYAC"}
{"call":"open","session":"b","sensor":"PHYAC"}
{"call":"set_option","session":"b","option":{"logN":1}}
{"call":"dispatch","sensor":"PHYAC","record":{"timestamp":1,"items":[{"class":1,"seq":0}]}}
)");
  EXPECT_EQ(
      run.out,
      "line 3: b on PHYAC sets {\"logN\":1}\n"
      "  key               merged to                       a           b           merged  property            "
      "decided by\n"
      "  mode              1 when all are 1                0 default   0 default   0       41 = 0              all\n"
      "  logN              minimum                         0 default   1           0                           a\n"
      "  logM              minimum                         0 default   0 default   0                           all\n"
      "  classMask         bitwise or                      -1 default  -1 default  -1      42 = -1             all\n"
      "  summary           the one that started the merge  1 default   1 default   1                           b\n"
      "  weightVar         the one that started the merge  -1 default  -1 default  -1                          b\n"
      "  continuous        1 when any is not 0             0 default   0 default   0                           all\n"
      "  spans                                                                             43 = 131073 (2, 1)\n"
      "  decisionsPerSpan                                                                  44 = 1\n"
      "  chain of a: batches of 1 = 2^(logN 0 - merged logM 0), voted (all weigh the same), all classes\n"
      "  chain of b: batches of 2 = 2^(logN 1 - merged logM 0), voted (all weigh the same), all classes\n"
      "\n"
      "b on PHYAC is open at the end\n"
      "  items lost when a negotiation cut their batch off: 1\n"
      "\n"
      "what became of the records\n"
      "  session  sensor  records  delivered  batch filling\n"
      "  a        PHYAC         1          1              0\n"
      "  b        PHYAC         1          0              1\n"
      "  last chain of a: batches of 1 = 2^(logN 0 - merged logM 0), voted (all weigh the same), all classes\n"
      "  last chain of b: batches of 2 = 2^(logN 1 - merged logM 0), voted (all weigh the same), all classes\n");
}

TEST(ExplainTrace, KnowsThatSessionsFromBeforeAnUninitNegotiateWithNobody) {
  const ToolRun run = runTool({"explain", "--records", "-"}, R"({"call":"open","session":"a","sensor":"STAP"}
{"call":"uninit"}
{"call":"open","session":"b","sensor":"STAP"}
{"call":"set_option","session":"b","option":{"classMask":1}}
{"call":"set_option","session":"a","option":{"classMask":2,"level":1}}
{"call":"dispatch","session":"a","record":{"timestamp":1,"classes":1}}
{"call":"close","session":"a"}
{"call":"close","session":"b"}
)");
  EXPECT_EQ(run.out,
            "line 4: b on STAP sets {\"classMask\":1}\n"
            "  key        merged to   b          merged  property  decided by\n"
            "  classMask  bitwise or  1          1       101 = 1   b\n"
            "  level      minimum     0 default  0       102 = 0   b\n"
            "\n"
            "line 5: a on STAP sets {\"classMask\":2,\"level\":1}\n"
            "  key        merged to   a  b          merged  property  decided by\n"
            "  classMask  bitwise or  2  1          3       101 = 3   all\n"
            "  level      minimum     1  0 default  0       102 = 0   b\n"
            "line 6: a on STAP class not wanted: bits 1, mask 2\n"
            "\n"
            "line 7: a on STAP leaves\n"
            "  key        merged to   b          merged  property  decided by\n"
            "  classMask  bitwise or  1          1       101 = 1   b\n"
            "  level      minimum     0 default  0       102 = 0   b\n"
            "\n"
            "line 8: b on STAP leaves\n"
            "\n"
            "what became of the records\n"
            "  session  sensor  records  delivered  class not wanted\n"
            "  a        STAP          1          0                 1\n"
            "  b        STAP          0          0                 0\n");
}

TEST(ExplainTrace, TellsWhatTheGestureEngineAnswered) {
  const auto gesture = [](int time, const char* engine) {
    return R"({"call":"dispatch","session":"a","record":{"timestamp":)" + std::to_string(time) +
           R"(,"prx":0,"samples":[[1,2,3,4,5,6],[1,2,3,4,5,6]]},"engine":)" + engine + "}\n";
  };
  const ToolRun run =
      runTool({"explain", "--records", "-"},
              R"({"call":"open","session":"a","sensor":"GSPX"})"
              "\n" +
                  gesture(1, R"([{"group":1,"name":"LetterA "}])") +
                  gesture(2, R"([{"group":0,"name":"LetterA "},{"group":1,"name":"LetterG "}])") + gesture(3, "[]"));
  EXPECT_EQ(run.out.substr(0, run.out.find("\n\n")),
            "line 2: a on GSPX delivered, where the gesture engine answered \"LetterA \"\n"
            "line 3: a on GSPX delivered, where the gesture engine answered \"LetterA \", \"LetterG \"\n"
            "line 4: a on GSPX no gesture recognised");
}

TEST(ExplainTrace, ExplainsASessionThatDoesNotOpen) {
  const ToolRun run = runTool({"explain", "--records", "-"}, R"({"call":"open","session":"a","sensor":"LPE_P"}
{"call":"set_option","session":"a","option":{}}
{"call":"dispatch","session":"a","record":{"timestamp":1,"class":1}}
{"call":"close","session":"a"}
)",
                              {{"SENSELOOM_AWARE_FAIL_ACTIVATE", "1"}});
  EXPECT_EQ(run.out.rfind("line 1: a on LPE_P does not open\n"
                          "  the platform's audio session cannot be switched on: the device refuses\n"
                          "    logged: activated aware failed\n",
                          0),
            0U)
      << run.out;
  EXPECT_NE(run.out.find("line 2: a on LPE_P sets {}\n  refused: the session did not open\n"
                         "line 3: a on LPE_P refused: its session is not open\n"),
            std::string::npos)
      << run.out;
  EXPECT_EQ(run.status, 0);
}

TEST(ExplainTrace, TellsOfAnOptionThatIsNull) {
  const ToolRun run = runTool({"explain", "-"}, R"({"call":"open","session":"a","sensor":"ISACT"}
{"call":"set_option","session":"a","option":null}
)");
  EXPECT_EQ(run.out,
            "line 2: a on ISACT sets a null pointer\n"
            "  a null pointer is refused\n"
            "  refused: nothing changes\n");
}

TEST(ExplainTrace, TakesNoMoreMemoryForALongTraceThanForAShortOne) {
#ifdef SANITIZED
  GTEST_SKIP() << "the sanitizer itself holds on to freed memory";
#endif
  const std::string file = testing::TempDir() + "long_trace_" + std::to_string(getpid());
  const auto explain = [&file](const char* records) {
    std::ofstream(file) << runTool({"generate", "commute", "--seed", "9", "--records", records}).out;
    return runTool({"explain", file, "--plot", file + ".svg"});
  };
  const ToolRun shortRun = explain("5000");
  const ToolRun longRun = explain("100000");
  std::remove(file.c_str());
  std::remove((file + ".svg").c_str());
  EXPECT_EQ(shortRun.status, 0);
  EXPECT_EQ(longRun.status, 0);
  EXPECT_LT(longRun.peakKilobytes, shortRun.peakKilobytes + 4096);
}

constexpr char kTroubled[] = R"({"call":"open","session":"a","sensor":"STAP"}
{"call":"set_option","session":"a","option":{"level":1}}
{"call":"set_option","session":"a","option":{"levle":1}}
{"call":"dispatch","session":"a","record":{"timestamp":1,"classes":1}}
{"call":"dispatch","session":"a","record":{"hex":"0000"}}
{"call":"open","session":"map","sensor":"PDR"}
{"call":"dispatch","session":"map","record":{"hex":"0000"}}
{"call":"close","session":"a"}
)";

TEST(ExplainProblems, AreAllThatIsPrintedWhenAsked) {
  const ToolRun run = runTool({"explain", "--problems", "-"}, kTroubled);
  EXPECT_EQ(run.out,
            "line 3: a on STAP sets {\"levle\":1}\n"
            "  unknown key \"levle\" has no effect: the nearest known key is \"level\"\n"
            "line 5: a on STAP too short: ends before its class or count\n"
            "line 7: map on PDR refused: ends before its number of items\n");
  EXPECT_EQ(run.status, 0);
}

TEST(ExplainProblems, AreNoneInATraceWithoutAny) {
  EXPECT_EQ(runTool({"explain", "--problems", "STAP", "{}"}).out, "");
  EXPECT_EQ(runTool({"explain", "--problems", "--records", "lift.jsonl"}).status, 2);
}

TEST(ExplainJson, TellsOfCallsRecordsAndSessions) {
  const ToolRun run = runTool({"explain", "--json", "--records", "-"}, kTroubled);
  const std::string negotiation = R"("negotiation":{"sessions":1,"keys":[)"
                                  R"({"key":"classMask","rule":"bitwise or","requests":[)"
                                  R"({"session":"a","value":3,"asked":3,"isDefault":true}],"merged":3,"before":)";
  EXPECT_EQ(
      run.out.substr(0, run.out.find('\n') + 1),
      R"({"line":2,"call":"set_option","session":"a","sensor":"STAP","option":"{\"level\":1}","told":[],)" +
          negotiation +
          R"(null,"decidedBy":["a"]},{"key":"level","rule":"minimum","requests":[)"
          R"({"session":"a","value":1,"asked":1,"isDefault":false}],"merged":1,"before":null,"decidedBy":["a"]}],)"
          R"("properties":[{"id":101,"name":"classMask","text":"3"},{"id":102,"name":"level","text":"1"}],)"
          R"("chains":[]}})"
          "\n");
  EXPECT_NE(run.out.find(R"("told":[{"about":"remark","text":"unknown key \"levle\" has no effect: )"
                         R"(the nearest known key is \"level\"","logged":null}],)" +
                         negotiation + "3,"),
            std::string::npos)
      << run.out;
  EXPECT_NE(run.out.find(R"({"line":7,"call":"dispatch","session":"map","sensor":"PDR","fate":"refused",)"
                         R"("why":"refused: ends before its number of items","unexplained":null})"
                         "\n"),
            std::string::npos)
      << run.out;
  EXPECT_NE(run.out.find(R"({"account":"a","sensor":"STAP","records":2,"fates":{"delivered":1,"too short":1},)"
                         R"("unexplained":0,"chain":null})"
                         "\n"),
            std::string::npos)
      << run.out;
  EXPECT_EQ(runTool({"explain", "--json", "--problems", "-"}, kTroubled).out.find(R"("line":2)"), std::string::npos);
}

TEST(ExplainJson, ShowsBytesThatAreNoTextAsNumbers) {
  EXPECT_NE(runTool({"explain", "--json", "-"}, R"({"call":"open","session":"a","sensor":"GSFLK"}
{"call":"set_option","session":"a","optionHex":"7bff"}
)")
                .out.find(R"("option":"{\\xff")"),
            std::string::npos);
}

// Opens and asks for `sessions`, sends each a record, and closes them.
std::string crowd(int sessions, int levels) {
  std::string trace;
  for (int i = 0; i < sessions; ++i) {
    const std::string name = "s" + std::to_string(i);
    trace += R"({"call":"open","session":")" + name + R"(","sensor":"STAP"})" + "\n" +
             R"({"call":"set_option","session":")" + name + R"(","option":{"level":)" + std::to_string(5 - i % levels) +
             "}}\n";
  }
  trace += R"({"call":"dispatch","sensor":"STAP","record":{"timestamp":1,"classes":1}})"
           "\n";
  for (int i = 0; i < sessions; ++i) trace += R"({"call":"close","session":"s)" + std::to_string(i) + "\"}\n";
  return trace;
}

TEST(ExplainManySessions, TakesAPage) {
  const ToolRun alike = runTool({"explain", "-"}, crowd(300, 1));
  EXPECT_LT(std::count(alike.out.begin(), alike.out.end(), '\n'), 60) << alike.out;
  EXPECT_NE(alike.out.find("  s0, s1, s2, s3 and 296 more  STAP          1          1\n"), std::string::npos)
      << alike.out;
  const ToolRun unlike = runTool({"explain", "-"}, crowd(300, 7));
  EXPECT_LT(std::count(unlike.out.begin(), unlike.out.end(), '\n'), 150) << unlike.out;
}

TEST(ExplainManySessions, ShowsWhatDiffers) {
  const std::string out = runTool({"explain", "-"}, crowd(9, 6)).out;
  EXPECT_NE(
      out.find("line 12: s5 on STAP sets {\"level\":0}\n"
               "  session     level\n"
               "  s5          0\n"
               "  5 more      ...\n"
               "  merged to   minimum\n"
               "  merged      0\n"
               "  before      1\n"
               "  property    102 = 0\n"
               "  decided by  s5\n"
               "\n"
               "lines 14 to 23: 7 more calls, after which everything is merged to what it was (--all shows them)\n"),
      std::string::npos)
      << out;
}

TEST(ExplainManySessions, ShowsAllWhenAsked) {
  const std::string out = runTool({"explain", "--all", "-"}, crowd(6, 6)).out;
  EXPECT_NE(out.find("line 12: s5 on STAP sets {\"level\":0}\n"
                     "  session     classMask   level\n"
                     "  s0          3 default   5\n"),
            std::string::npos)
      << out;
  EXPECT_NE(out.find("line 14: s0 on STAP leaves\n"), std::string::npos) << out;
  EXPECT_EQ(out.find("more"), std::string::npos) << out;
}

TEST(ExplainOptions, OpensASessionAnOption) {
  const ToolRun run =
      runTool({"explain", "STAP", R"({"classMask":1,"levle":2})", R"({"classMask":4,"level":6})", "{}"});
  EXPECT_EQ(run.out,
            "session 1 on STAP sets {\"classMask\":1,\"levle\":2}\n"
            "  unknown key \"levle\" has no effect: the nearest known key is \"level\"\n"
            "  key        merged to   session 1  merged  property  decided by\n"
            "  classMask  bitwise or  1          1       101 = 1   session 1\n"
            "  level      minimum     0 default  0       102 = 0   session 1\n"
            "\n"
            "session 2 on STAP sets {\"classMask\":4,\"level\":6}\n"
            "  \"classMask\" 4 is not in 1..3: 3 is used\n"
            "    logged: tapping: invalid clsmask value 4\n"
            "  \"level\" 6 is not in -5..5: 6 is kept\n"
            "    logged: tapping: invalid level value 6\n"
            "  the bad \"level\" sets \"classMask\" to 0: no tap is delivered\n"
            "  key        merged to   session 1  session 2  merged  property  decided by\n"
            "  classMask  bitwise or  1          0 for 4    1       101 = 1   session 1\n"
            "  level      minimum     0 default  6          0       102 = 0   session 1\n"
            "\n"
            "session 3 on STAP sets {}\n"
            "  key        merged to   session 1  session 2  session 3  merged  property  decided by\n"
            "  classMask  bitwise or  1          0 for 4    3 default  3       101 = 3   session 3\n"
            "  level      minimum     0 default  6          0 default  0       102 = 0   session 1, session 3\n");
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.status, 0);
}

TEST(ExplainOptions, WorksForEverySensor) {
  for (const char* sensor :
       {"PHYAC", "STAP", "GSFLK", "SHAKI", "ISACT", "SCOUN", "GSPX", "GSETH", "LPE_P", "PDR", "LIFT"}) {
    const ToolRun run = runTool({"explain", sensor, "{}", R"({"nonsense":1})"});
    EXPECT_NE(run.out.find("unknown key \"nonsense\""), std::string::npos) << sensor;
    EXPECT_EQ(run.out.find("unexplained"), std::string::npos) << run.out;
    EXPECT_EQ(run.status, 0) << sensor;
  }
}

TEST(ExplainOptions, ShowsConflictsOfTemplateGestures) {
  const ToolRun run = runTool({"explain", "DTWGS", R"({"mode":1,"index":1})", R"({"mode":1})"});
  EXPECT_NE(run.out.find("  no property list: several sessions enroll, and one can at a time\n"
                         "    logged: option invalid\n"),
            std::string::npos)
      << run.out;
  EXPECT_EQ(run.out.find("unexplained"), std::string::npos);
  EXPECT_EQ(run.status, 0);
}

TEST(ExplainErrors, AreBadInput) {
  const auto expectError = [](const std::vector<std::string>& line, const std::string& message) {
    const ToolRun run = runTool(line);
    EXPECT_EQ(run.err, "senseloom: " + message + "\n");
    EXPECT_EQ(run.status, 2) << testing::PrintToString(line);
  };
  expectError({"explain", "STPA", "{}"},
              "unknown sensor \"STPA\": the nearest is \"STAP\"; `senseloom sensors` prints all");
  expectError({"explain", "STPA"},
              "STPA: No such file or directory, and no sensor has that name; the nearest is \"STAP\"");
  expectError({"explain", "no-such-file.jsonl"},
              "no-such-file.jsonl: No such file or directory, and no sensor has that name");
  expectError({"explain", "STAP"}, "no option string for a session on STAP");
  expectError({"explain", "STAP", "{}", "{\"level\":"},
              "the option of session 2 is no JSON: unexpected token near end of file");
  expectError({"explain", "README.md"}, "README.md:1: not JSON: '[' or '{' expected near '#'");
}

TEST(ExplainErrors, OfAnOptionComeAfterItsExplanation) {
  const ToolRun run = runTool({"explain", "ISACT", "none"});
  EXPECT_EQ(run.out,
            "session 1 on ISACT sets none\n"
            "  not JSON ('[' or '{' expected near 'none'): accepted all the same, and the session keeps its option\n"
            "    logged: instantactivity: invalid opton string none, all set as default\n"
            "  key        merged to   session 1   merged  property  decided by\n"
            "  classMask  bitwise or  15 default  15      151 = 15  session 1\n");
  EXPECT_EQ(run.status, 2);
}

TEST(ExplainErrors, OfATraceComeAfterWhatWasBefore) {
  const ToolRun run = runTool({"explain", "-"}, R"({"call":"open","session":"a","sensor":"SHAKI"}
{"call":"set_option","session":"a","option":{}}
stop
)");
  EXPECT_EQ(run.out,
            "line 2: a on SHAKI sets {}\n"
            "  key          merged to  a          merged  property  decided by\n"
            "  sensitivity  maximum    1 default  1       81 = 1    a\n");
  EXPECT_EQ(run.err.rfind("senseloom: standard input:3: not JSON: ", 0), 0U) << run.err;
  EXPECT_EQ(run.status, 2);
}

TEST(ExplainErrors, AreReportedForLinesThatMixBothUses) {
  for (const char* flag : {"--records", "--plot=x.svg"}) {
    const ToolRun run = runTool({"explain", flag, "STAP", "{}"});
    EXPECT_NE(run.err, "");
    EXPECT_EQ(run.status, 2) << flag;
  }
}

}  // namespace
}  // namespace senseloom::tool
