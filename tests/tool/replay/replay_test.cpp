#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdio>
#include <fstream>
#include <string>

#include "run_tool.h"

namespace senseloom::tool {
namespace {

// Two clients of one sensor: what both of them want reaches both.
constexpr char kTwoClients[] = R"({"call":"open","session":"lock","sensor":"STAP"}
{"call":"open","session":"camera","sensor":"STAP"}
{"call":"set_option","session":"camera","option":{"classMask":2,"level":-1}}
{"call":"dispatch","sensor":"STAP","record":{"timestamp":81,"classes":1}}
{"call":"dispatch","sensor":"STAP","record":{"timestamp":82,"classes":4}}

{"call":"dispatch","session":"camera","record":{"timestamp":83,"classes":3}}
{"call":"set_option","session":"lock","option":"{"}
{"call":"close","session":"lock"}
{"call":"close","session":"camera"}
)";

TEST(ReplayTable, ShowsCallsAndWhatEachClientReceives) {
  const ToolRun run = runTool({"replay", "-"}, kTwoClients);
  EXPECT_EQ(
      run.out,
      "  line  call        session   sensor  return  outcome\n"
      "     1  open        lock      STAP    handle\n"
      "     2  open        camera    STAP    handle\n"
      "     3  set_option  camera    STAP    0       {\"classMask\":2,\"level\":-1} -> 101 classMask=3, 102 level=-1\n"
      "     4  dispatch    lock      STAP    1       timestamp=81 classes=1 -> the record\n"
      "     7  dispatch    camera    STAP    1       timestamp=83 classes=3 -> the record\n"
      "     8  set_option  lock      STAP    -1      { -> failed\n"
      "     9  close       lock      STAP    1       101 classMask=2, 102 level=-1\n"
      "    10  close       camera    STAP    0\n");
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.status, 0);
}

TEST(ReplayTable, ShowsRecordsThatDeliveredNothingOnDemand) {
  const ToolRun run = runTool({"replay", "--all", "-"}, kTwoClients);
  EXPECT_EQ(
      run.out,
      "  line  call        session   sensor  return  outcome\n"
      "     1  open        lock      STAP    handle\n"
      "     2  open        camera    STAP    handle\n"
      "     3  set_option  camera    STAP    0       {\"classMask\":2,\"level\":-1} -> 101 classMask=3, 102 level=-1\n"
      "     4  dispatch    lock      STAP    1       timestamp=81 classes=1 -> the record\n"
      "     4  dispatch    camera    STAP    0       timestamp=81 classes=1\n"
      "     5  dispatch    lock      STAP    0       timestamp=82 classes=4\n"
      "     5  dispatch    camera    STAP    0       timestamp=82 classes=4\n"
      "     7  dispatch    camera    STAP    1       timestamp=83 classes=3 -> the record\n"
      "     8  set_option  lock      STAP    -1      { -> failed\n"
      "     9  close       lock      STAP    1       101 classMask=2, 102 level=-1\n"
      "    10  close       camera    STAP    0\n");
  EXPECT_EQ(run.status, 0);
}

TEST(ReplayTable, KeepsColumnsApartForLongSessionNames) {
  const ToolRun run = runTool({"replay", "-"}, R"({"call":"open","session":"a","sensor":"LIFT"}
{"call":"open","session":"a-client-of-lifts","sensor":"LIFT"}
{"call":"close","session":"a"}
)");
  EXPECT_EQ(run.out,
            "  line  call        session   sensor  return  outcome\n"
            "     1  open        a         LIFT    handle\n"
            "     2  open        a-client-of-lifts  LIFT    handle\n"
            "     3  close       a                  LIFT    1       201 classMask=3\n"
            "   end  close       a-client-of-lifts  LIFT    0\n");
}

TEST(ReplayTable, CutsLongListsAndBytesShort) {
  const ToolRun run = runTool({"replay", "-"},
                              R"({"call":"open","session":"a","sensor":"PHYAC"}
{"call":"dispatch","session":"a","record":{"timestamp":1,"items":[{"class":1,"seq":1},{"class":2,"seq":2},)"
                              R"({"class":3,"seq":3},{"class":4,"seq":4}]}}
{"call":"dispatch","session":"a","record":{"timestamp":1,"items":[{"class":1,"seq":1},{"class":2,"seq":2},)"
                              R"({"class":3,"seq":3},{"class":4,"seq":4},{"class":5,"seq":5}]}}
{"call":"open","session":"b","sensor":"PDR"}
{"call":"dispatch","session":"b","record":{"timestamp":2,"items":["00112233445566778899aabbccddeeff00112233445566778899aabb"]}}
{"call":"open","session":"c","sensor":"DTWGS"}
{"call":"set_option","session":"c","option":{"mode":4,"classMask":1,"template1":"001000112233445566778899aabbccddeeff"}}
{"call":"set_option","session":"c","option":{"mode":4,"classMask":1,"template1":"001100112233445566778899aabbccddeeff00"}}
)");
  EXPECT_EQ(
      run.out,
      "  line  call        session   sensor  return  outcome\n"
      "     1  open        a         PHYAC   handle\n"
      "     2  dispatch    a         PHYAC   1       timestamp=1 items=[class=1 seq=1, class=2 seq=2, class=3 seq=3, "
      "class=4 seq=4] -> the record\n"
      "     3  dispatch    a         PHYAC   1       timestamp=1 items=[class=1 seq=1, class=2 seq=2, class=3 seq=3, "
      "class=4 seq=4, ... (5)] -> the record\n"
      "     4  open        b         PDR     handle\n"
      "     5  dispatch    b         PDR     1       timestamp=2 items=[00112233445566778899aabbccddeeff...] -> the "
      "record\n"
      "     6  open        c         DTWGS   handle\n"
      "     7  set_option  c         DTWGS   0       {\"mode\":4,\"classMask\":1,\"template1\":"
      "\"001000112233445566778899aabbccddeeff\"} -> 121 level=0, 122 templateNumber=0, 123 "
      "templateData=00112233445566778899aabbccddeeff\n"
      "     8  set_option  c         DTWGS   0       {\"mode\":4,\"classMask\":1,\"template1\":"
      "\"001100112233445566778899aabbccddeeff00\"} -> 121 level=0, 122 templateNumber=0, 123 "
      "templateData=00112233445566778899aabbccddeeff... (17 bytes)\n"
      "   end  close       a         PHYAC   0\n"
      "   end  close       b         PDR     0\n"
      "   end  close       c         DTWGS   0\n");
}

TEST(ReplayTable, ShowsResultsThatAreNotARecordAsBytes) {
  const ToolRun run = runTool({"replay", "-"}, R"({"call":"open","session":"a","sensor":"LIFT"}
{"call":"dispatch","session":"a","record":{"hex":"0102ff"}}
{"call":"dispatch","session":"a","record":{"hex":""}}
{"call":"close","session":"a"}
)");
  EXPECT_EQ(run.out,
            "  line  call        session   sensor  return  outcome\n"
            "     1  open        a         LIFT    handle\n"
            "     2  dispatch    a         LIFT    1       0102ff -> the record\n"
            "     3  dispatch    a         LIFT    1       no bytes -> the record\n"
            "     4  close       a         LIFT    0\n");
}

TEST(ReplayTable, IsEmptyForAnEmptyTrace) {
  const ToolRun run = runTool({"replay", "-"}, "\n\n");
  EXPECT_EQ(run.out, "");
  EXPECT_EQ(run.err, "senseloom: standard input: the trace is empty: there is no call in it\n");
  EXPECT_EQ(run.status, 0);
}

TEST(ReplayJson, PrintsOneObjectPerCallAndSession) {
  const ToolRun run = runTool({"replay", "--json", "-"}, kTwoClients);
  EXPECT_EQ(run.out,
            R"({"line":1,"call":"open","session":"lock","sensor":"STAP","return":"handle"}
{"line":2,"call":"open","session":"camera","sensor":"STAP","return":"handle"}
{"line":3,"call":"set_option","session":"camera","sensor":"STAP","return":0,"option":"{\"classMask\":2,\"level\":-1}","properties":[{"id":101,"name":"classMask","value":3},{"id":102,"name":"level","value":-1}]}
{"line":4,"call":"dispatch","session":"lock","sensor":"STAP","return":1,"record":{"timestamp":81,"classes":1},"recordHex":"51000000000000000100","result":{"timestamp":81,"classes":1},"hex":"51000000000000000100"}
{"line":4,"call":"dispatch","session":"camera","sensor":"STAP","return":0,"record":{"timestamp":81,"classes":1},"recordHex":"51000000000000000100","result":null,"hex":null}
{"line":5,"call":"dispatch","session":"lock","sensor":"STAP","return":0,"record":{"timestamp":82,"classes":4},"recordHex":"52000000000000000400","result":null,"hex":null}
{"line":5,"call":"dispatch","session":"camera","sensor":"STAP","return":0,"record":{"timestamp":82,"classes":4},"recordHex":"52000000000000000400","result":null,"hex":null}
{"line":7,"call":"dispatch","session":"camera","sensor":"STAP","return":1,"record":{"timestamp":83,"classes":3},"recordHex":"53000000000000000300","result":{"timestamp":83,"classes":3},"hex":"53000000000000000300"}
{"line":8,"call":"set_option","session":"lock","sensor":"STAP","return":-1,"option":"{","properties":null}
{"line":9,"call":"close","session":"lock","sensor":"STAP","return":1,"properties":[{"id":101,"name":"classMask","value":2},{"id":102,"name":"level","value":-1}]}
{"line":10,"call":"close","session":"camera","sensor":"STAP","return":0,"properties":null}
)");
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.status, 0);
}

TEST(ReplayJson, HasNullForTheLineOfAClosingAtTheEndAndNoSessionForUninit) {
  const ToolRun run = runTool({"replay", "--json", "-"}, R"({"call":"uninit"}
{"call":"open","session":"a","sensor":"GSPX"}
{"call":"set_option","session":"a","option":{}}
)");
  EXPECT_EQ(run.out,
            R"({"line":1,"call":"uninit"}
{"line":2,"call":"open","session":"a","sensor":"GSPX","return":"handle"}
{"line":3,"call":"set_option","session":"a","sensor":"GSPX","return":0,"option":"{}","properties":[]}
{"line":null,"call":"close","session":"a","sensor":"GSPX","return":0,"properties":null}
)");
}

TEST(ReplayJson, HoldsTemplateBytesWhole) {
  const std::string data(1800, 'a');
  const ToolRun run = runTool({"replay", "--json", "-"}, R"({"call":"open","session":"a","sensor":"DTWGS"}
{"call":"set_option","session":"a","option":{"mode":4,"classMask":2,"level":1,"template2":"0384)" +
                                                             data + "\"}}\n");
  EXPECT_EQ(
      run.out,
      R"({"line":1,"call":"open","session":"a","sensor":"DTWGS","return":"handle"}
{"line":2,"call":"set_option","session":"a","sensor":"DTWGS","return":0,"option":"{\"mode\":4,\"classMask\":2,\"level\":1,\"template2\":\"0384)" +
          data +
          R"(\"}","properties":[{"id":121,"name":"level","value":1},{"id":122,"name":"templateNumber","value":1},{"id":123,"name":"templateData","hex":")" +
          data + R"("}]}
{"line":null,"call":"close","session":"a","sensor":"DTWGS","return":0,"properties":null}
)");
}

TEST(ReplayJson, ShowsATemplateOfFourBytesAsBytes) {
  const ToolRun run = runTool({"replay", "--json", "-"}, R"({"call":"open","session":"a","sensor":"DTWGS"}
{"call":"set_option","session":"a","option":{"mode":4,"classMask":1,"template1":"000401020304"}}
)");
  EXPECT_NE(run.out.find(R"({"id":123,"name":"templateData","hex":"01020304"})"), std::string::npos) << run.out;
}

TEST(ReplayJson, HoldsResultsThatAreNotARecordAsHexAlone) {
  const ToolRun run = runTool({"replay", "--json", "-"}, R"({"call":"open","session":"a","sensor":"LIFT"}
{"call":"dispatch","session":"a","record":{"hex":"0102FF"}}
{"call":"dispatch","session":"a","record":{"hex":""}}
{"call":"close","session":"a"}
)");
  EXPECT_EQ(run.out,
            R"({"line":1,"call":"open","session":"a","sensor":"LIFT","return":"handle"}
{"line":2,"call":"dispatch","session":"a","sensor":"LIFT","return":1,"record":null,"recordHex":"0102ff","result":null,"hex":"0102ff"}
{"line":3,"call":"dispatch","session":"a","sensor":"LIFT","return":1,"record":null,"recordHex":"","result":null,"hex":""}
{"line":4,"call":"close","session":"a","sensor":"LIFT","return":0,"properties":null}
)");
}

TEST(ReplayJson, IsNotMixedWithWhatTheLibraryWritesToStandardOutput) {
  const ToolRun run = runTool({"replay", "--json", "-"}, R"({"call":"open","session":"a","sensor":"LPE_P"}
{"call":"close","session":"a"}
)");
  EXPECT_EQ(run.out,
            R"({"line":1,"call":"open","session":"a","sensor":"LPE_P","return":"handle"}
{"line":2,"call":"close","session":"a","sensor":"LPE_P","return":0,"properties":null}
)");
  EXPECT_EQ(run.err, "deactivating aware session...\n");
}

TEST(ReplaySummary, CountsRecordsResultsAndFailedCallsPerClient) {
  const ToolRun run = runTool({"replay", "--quiet", "-"}, kTwoClients);
  EXPECT_EQ(run.out,
            "session  sensor    opened   records   results    failed\n"
            "lock     STAP           1         2         1         1\n"
            "camera   STAP           1         3         1         0\n");
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.status, 0);
}

TEST(ReplaySummary, AddsUpTheSessionsOfOneNameOnOneSensor) {
  const ToolRun run = runTool({"replay", "--quiet", "-"}, R"({"call":"open","session":"a-long-name","sensor":"LIFT"}
{"call":"dispatch","session":"a-long-name","record":{"timestamp":1,"class":1}}
{"call":"open","session":"b","sensor":"LIFT"}
{"call":"close","session":"a-long-name"}
{"call":"open","session":"a-long-name","sensor":"LIFT"}
{"call":"dispatch","sensor":"LIFT","record":{"timestamp":2,"class":1}}
{"call":"close","session":"a-long-name"}
{"call":"open","session":"a-long-name","sensor":"STAP"}
)");
  EXPECT_EQ(run.out,
            "session      sensor    opened   records   results    failed\n"
            "a-long-name  LIFT           2         2         2         0\n"
            "b            LIFT           1         1         1         0\n"
            "a-long-name  STAP           1         0         0         0\n");
}

TEST(Replay, DispatchesToTheSessionsOfASensorInOpeningOrder) {
  const ToolRun run = runTool({"replay", "-"}, R"({"call":"open","session":"c","sensor":"LIFT"}
{"call":"open","session":"a","sensor":"LIFT"}
{"call":"open","session":"x","sensor":"SHAKI"}
{"call":"open","session":"b","sensor":"LIFT"}
{"call":"close","session":"c"}
{"call":"open","session":"c","sensor":"LIFT"}
{"call":"dispatch","sensor":"LIFT","record":{"timestamp":1,"class":1}}
)");
  EXPECT_EQ(run.out,
            "  line  call        session   sensor  return  outcome\n"
            "     1  open        c         LIFT    handle\n"
            "     2  open        a         LIFT    handle\n"
            "     3  open        x         SHAKI   handle\n"
            "     4  open        b         LIFT    handle\n"
            "     5  close       c         LIFT    1       201 classMask=3\n"
            "     6  open        c         LIFT    handle\n"
            "     7  dispatch    a         LIFT    1       timestamp=1 class=1 -> the record\n"
            "     7  dispatch    b         LIFT    1       timestamp=1 class=1 -> the record\n"
            "     7  dispatch    c         LIFT    1       timestamp=1 class=1 -> the record\n"
            "   end  close       a         LIFT    1       201 classMask=3\n"
            "   end  close       x         SHAKI   0\n"
            "   end  close       b         LIFT    1       201 classMask=3\n"
            "   end  close       c         LIFT    0\n");
}

TEST(Replay, GivesARecordToNobodyWhenItsSensorHasNoSession) {
  const ToolRun run =
      runTool({"replay", "-"}, R"({"call":"dispatch","sensor":"LIFT","record":{"timestamp":1,"class":1}})");
  EXPECT_EQ(run.out, "");
  EXPECT_EQ(run.status, 0);
}

TEST(Replay, KeepsTheNameOfASessionThatDidNotOpenAndItsCallsFail) {
  const std::string trace = R"({"call":"open","session":"a","sensor":"LPE_P"}
{"call":"set_option","session":"a","option":{}}
{"call":"dispatch","session":"a","record":{"timestamp":1,"class":1}}
{"call":"dispatch","sensor":"LPE_P","record":{"timestamp":2,"class":1}}
{"call":"open","session":"a","sensor":"LPE_P"}
{"call":"close","session":"a"}
{"call":"open","session":"a","sensor":"LPE_P"}
)";
  const Environment failing{{"SENSELOOM_AWARE_FAIL_ACTIVATE", "1"}};
  const ToolRun table = runTool({"replay", "-"}, trace, failing);
  EXPECT_EQ(table.out,
            "  line  call        session   sensor  return  outcome\n"
            "     1  open        a         LPE_P   NULL    failed\n"
            "     2  set_option  a         LPE_P   -1      {} -> failed\n"
            "     3  dispatch    a         LPE_P   -1      timestamp=1 class=1 -> failed\n"
            "     5  open        a         LPE_P   NULL    failed\n"
            "     6  close       a         LPE_P   -1      failed\n"
            "     7  open        a         LPE_P   NULL    failed\n");
  EXPECT_EQ(table.status, 0);
  EXPECT_EQ(runTool({"replay", "--quiet", "-"}, trace, failing).out,
            "session  sensor    opened   records   results    failed\n"
            "a        LPE_P          0         1         0         6\n");
  EXPECT_EQ(runTool({"replay", "--json", "-"}, R"({"call":"open","session":"a","sensor":"LPE_P"})", failing).out,
            R"({"line":1,"call":"open","session":"a","sensor":"LPE_P","return":null}
)");
}

TEST(Replay, FreesTheNameOfASessionWhoseClosingFailed) {
  const ToolRun run = runTool({"replay", "-"}, R"({"call":"open","session":"a","sensor":"LPE_P"}
{"call":"close","session":"a"}
{"call":"open","session":"a","sensor":"LPE_P"}
)",
                              {{"SENSELOOM_AWARE_FAIL_DEACTIVATE", "1"}});
  EXPECT_EQ(run.out,
            "  line  call        session   sensor  return  outcome\n"
            "     1  open        a         LPE_P   handle\n"
            "     2  close       a         LPE_P   -1      failed\n"
            "     3  open        a         LPE_P   handle\n"
            "   end  close       a         LPE_P   -1      failed\n");
  EXPECT_EQ(run.status, 0);
}

TEST(Replay, PassesANullOptionOn) {
  const ToolRun run = runTool({"replay", "-"}, R"({"call":"open","session":"a","sensor":"ISACT"}
{"call":"set_option","session":"a","option":"no JSON"}
{"call":"set_option","session":"a","option":null}
{"call":"close","session":"a"}
)");
  EXPECT_EQ(run.out,
            "  line  call        session   sensor  return  outcome\n"
            "     1  open        a         ISACT   handle\n"
            "     2  set_option  a         ISACT   0       no JSON -> 151 classMask=15\n"
            "     3  set_option  a         ISACT   -1      NULL -> failed\n"
            "     4  close       a         ISACT   0\n");
}

TEST(Replay, KeepsFeedingAndClosesSessionsThatWereOpenedBeforeUninit) {
  const ToolRun run = runTool({"replay", "-"}, R"({"call":"open","session":"a","sensor":"STAP"}
{"call":"set_option","session":"a","option":{"classMask":1}}
{"call":"uninit"}
{"call":"dispatch","sensor":"STAP","record":{"timestamp":1,"classes":1}}
{"call":"open","session":"b","sensor":"STAP"}
{"call":"set_option","session":"b","option":{"classMask":2}}
{"call":"close","session":"b"}
)");
  EXPECT_EQ(run.out,
            "  line  call        session   sensor  return  outcome\n"
            "     1  open        a         STAP    handle\n"
            "     2  set_option  a         STAP    0       {\"classMask\":1} -> 101 classMask=1, 102 level=0\n"
            "     3  uninit\n"
            "     4  dispatch    a         STAP    1       timestamp=1 classes=1 -> the record\n"
            "     5  open        b         STAP    handle\n"
            "     6  set_option  b         STAP    0       {\"classMask\":2} -> 101 classMask=2, 102 level=0\n"
            "     7  close       b         STAP    0\n"
            "   end  close       a         STAP    0\n");
}

TEST(Replay, ShowsLogLinesFromTheLevelOnThatIsAskedFor) {
  const std::string trace = R"({"call":"open","session":"a","sensor":"STAP"}
{"call":"set_option","session":"a","option":{"level":6}}
)";
  const std::string rejection = "tapping: invalid level value 6\n";
  const std::string negotiation = "The 0 of 1 session of sensor STAP has ";
  const auto logged = [&trace](const char* level) { return runTool({"replay", "--log", level, "-"}, trace).err; };
  EXPECT_EQ(logged("none"), "");
  for (const char* level : {"error", "warn", "info", "debug"}) {
    EXPECT_NE(logged(level).find(rejection), std::string::npos) << level;
  }
  for (const char* level : {"error", "warn"}) EXPECT_EQ(logged(level).find(negotiation), std::string::npos) << level;
  for (const char* level : {"info", "debug"}) EXPECT_NE(logged(level).find(negotiation), std::string::npos) << level;
}

TEST(Replay, TakesNoMoreMemoryForALongTraceThanForAShortOne) {
#ifdef SANITIZED
  GTEST_SKIP() << "the sanitizer itself holds on to freed memory";
#endif
  // From a file, since a child's peak begins with the memory of its parent.
  const std::string file = testing::TempDir() + "long_trace_" + std::to_string(getpid());
  const auto replay = [&file](int records) {
    std::ofstream trace(file);
    trace << R"({"call":"open","session":"a","sensor":"PHYAC"})" << '\n';
    for (int i = 0; i < records; ++i) {
      trace << R"({"call":"dispatch","sensor":"PHYAC","record":{"timestamp":81,"items":[{"class":3,"seq":5}]}})"
            << '\n';
    }
    trace.close();
    return runTool({"replay", "--json", file});
  };
  const ToolRun shortRun = replay(1000);
  const ToolRun longRun = replay(100000);
  std::remove(file.c_str());
  EXPECT_EQ(shortRun.status, 0);
  EXPECT_EQ(longRun.status, 0);
  EXPECT_LT(longRun.peakKilobytes, shortRun.peakKilobytes + 1024);
}

}  // namespace
}  // namespace senseloom::tool
