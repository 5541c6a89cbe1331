#include <gtest/gtest.h>
#include <unistd.h>

#include <fstream>
#include <string>
#include <vector>

#include "recording.h"

namespace senseloom::tool {
namespace {

constexpr char kRecording[] = R"({"call":"open","session":"s1","sensor":"STAP","returned":"handle"}
{"call":"set_option","session":"s1","option":"{\"classMask\":2}","returned":0,"properties":[{"id":101,"size":4,"value":"02000000"},{"id":102,"size":4,"value":"00000000"}]}
{"note":"a line of its own"}
{"call":"dispatch","session":"s1","record":{"hex":"01000000000000000200"},"returned":1,"result":{"hex":"01000000000000000200"}}
{"call":"dispatch","session":"s1","record":{"hex":"02000000000000000100"},"returned":0}
{"call":"set_option","session":"s1","option":"{","returned":-1}
{"call":"close","session":"s1","returned":0}
)";

ToolRun checkText(const std::string& trace) {
  return runTool({"replay", "--check", "-"}, trace);
}

// Checks the recording with a piece of it replaced, and expects one difference.
void expectDifference(const std::string& piece, const std::string& replacement, const std::string& difference) {
  std::string tampered = kRecording;
  tampered.replace(tampered.find(piece), piece.size(), replacement);
  const ToolRun run = checkText(tampered);
  EXPECT_EQ(run.out, "standard input:" + difference + "  this is the first difference: what follows may come of it\n");
  EXPECT_EQ(run.err, "senseloom: 1 of 6 calls compared differ\n");
  EXPECT_EQ(run.status, 1);
}

TEST(ReplayCheck, AgreesWithARecording) {
  const ToolRun run = checkText(kRecording);
  EXPECT_EQ(run.out, "6 calls compared, all as recorded\n");
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.status, 0);
}

TEST(ReplayCheck, ShowsAnotherReturnValue) {
  expectDifference(R"("returned":-1)", R"("returned":0)",
                   "6: set_option of session \"s1\" differs from the recording\n"
                   "  what      recorded  now\n"
                   "  returned  0         -1\n");
  expectDifference(R"("returned":"handle")", R"("returned":null)",
                   "1: open of session \"s1\" differs from the recording\n"
                   "  what      recorded  now\n"
                   "  returned  null      handle\n");
}

TEST(ReplayCheck, ShowsAnotherPropertyByItsName) {
  expectDifference(R"("value":"02000000")", R"("value":"03000000")",
                   "2: set_option of session \"s1\" differs from the recording\n"
                   "  what           recorded  now\n"
                   "  101 classMask  3         2\n");
}

TEST(ReplayCheck, ShowsWhatIsMissingAndWhatIsTooMuch) {
  expectDifference(R"("returned":0})", R"("returned":0,"properties":[]})",
                   "5: dispatch of session \"s1\" differs from the recording\n"
                   "  what           recorded      now\n"
                   "  property list  0 properties  none\n");
  expectDifference(R"(,{"id":102,"size":4,"value":"00000000"})", "",
                   "2: set_option of session \"s1\" differs from the recording\n"
                   "  what       recorded  now\n"
                   "  102 level  none      0\n");
  expectDifference(R"(,"result":{"hex":"01000000000000000200"})", "",
                   "4: dispatch of session \"s1\" differs from the recording\n"
                   "  what    recorded  now\n"
                   "  result  none      {\"timestamp\":1,\"classes\":2}\n");
}

TEST(ReplayCheck, ShowsTheFieldOfAResultThatDiffers) {
  expectDifference(R"("result":{"hex":"01)", R"("result":{"hex":"03)",
                   "4: dispatch of session \"s1\" differs from the recording\n"
                   "  what       recorded  now\n"
                   "  timestamp  3         1\n");
}

TEST(ReplayCheck, ShowsTheItemsOfAResultThatDiffer) {
  const ToolRun run = checkText(R"({"call":"open","session":"a","sensor":"PHYAC","returned":"handle"}
{"call":"dispatch","session":"a","record":{"hex":"0100000000000000020011002200"},"returned":1,"result":{"hex":"0100000000000000020011002300"}}
)");
  EXPECT_NE(run.out.find("  what      recorded             now\n"
                         "  items[1]  {\"class\":3,\"seq\":2}  {\"class\":2,\"seq\":2}\n"),
            std::string::npos)
      << run.out;
}

constexpr char kThreeDifferences[] = R"({"call":"open","session":"a","sensor":"LIFT","returned":null}
{"call":"open","session":"b","sensor":"LIFT"}
{"call":"dispatch","sensor":"LIFT","record":{"hex":""},"returned":0}
)";

TEST(ReplayCheck, ShowsEveryDifferenceAndWhichIsTheFirst) {
  const ToolRun run = checkText(kThreeDifferences);
  const std::string rest =
      " differs from the recording\n"
      "  what      recorded  now\n"
      "  returned  0         1\n"
      "  result    none      no bytes\n";
  EXPECT_EQ(run.out,
            "standard input:1: open of session \"a\" differs from the recording\n"
            "  what      recorded  now\n"
            "  returned  null      handle\n"
            "  this is the first difference: what follows may come of it\n"
            "standard input:3: dispatch of session \"a\"" +
                rest + "standard input:3: dispatch of session \"b\"" + rest);
  EXPECT_EQ(run.err, "senseloom: 3 of 3 calls compared differ\n");
  EXPECT_EQ(run.status, 1);
}

TEST(ReplayCheck, ShowsNoMoreDifferencesThanAreWanted) {
  const ToolRun run = runTool({"replay", "--check", "--limit", "1", "-"}, kThreeDifferences);
  EXPECT_NE(run.out.find("may come of it\n2 more calls differ\n"), std::string::npos) << run.out;
  EXPECT_EQ(run.err, "senseloom: 3 of 3 calls compared differ\n");
}

TEST(ReplayCheck, PrintsJson) {
  const ToolRun run = runTool({"replay", "--check", "--json", "--limit", "1", "-"}, kThreeDifferences);
  EXPECT_EQ(run.out, R"({"line":1,"call":"open","session":"a","isFirst":true,)"
                     R"("differences":[{"what":"returned","recorded":"null","now":"handle"}]})"
                     "\n");
  EXPECT_EQ(run.status, 1);
  EXPECT_EQ(runTool({"replay", "--check", "--json", "-"}, kRecording).out, "");
}

TEST(ReplayCheck, SaysThatARecordingDoesNotHoldWhatTheGestureEngineAnswered) {
  const std::string record =
      "01000000000000000000"
      "0c00" +
      std::string(24, '0');
  const ToolRun run = checkText(R"({"call":"open","session":"a","sensor":"GSPX","returned":"handle"}
{"call":"dispatch","session":"a","record":{"hex":")" +
                                record + R"("},"returned":1,"result":{"hex":"0100000000000000050000000000000000000000"}}
)");
  EXPECT_NE(run.out.find("  the recording does not hold what the platform's gesture engine answered\n"),
            std::string::npos)
      << run.out;
}

TEST(ReplayCheck, AnswersTheLibraryAsTheRecordedGestureEngineDid) {
  const std::string recording = R"({"call":"open","session":"a","sensor":"GSPX","returned":"handle"}
{"call":"set_option","session":"a","option":"{\"classMask\":-1}","returned":0,"properties":[]}
{"call":"dispatch","session":"a","record":{"timestamp":1,"prx":0,"samples":[[1,2,3,4,5,6],[1,2,3,4,5,6]]},"engine":[{"group":0,"name":"LetterA "},{"group":1,"name":"LetterG "}],"returned":1,"result":{"hex":"01000000000000000b001800010002000300040005000600010002000300040005000600"}}
{"call":"dispatch","session":"a","record":{"timestamp":2,"prx":0,"samples":[[1,2,3,4,5,6]]},"engine":[],"returned":0}
{"call":"dispatch","session":"a","record":{"timestamp":3,"prx":0,"samples":[[1,2,3,4,5,6]]},"returned":0}
)";
  // The script of the host's engine is for the records that the recording has no answers for.
  const ToolRun run =
      runTool({"replay", "--check", "-"}, recording, {{"SENSELOOM_GESTURE_SCRIPT", "gesture_hmm.script"}});
  EXPECT_EQ(run.out,
            "standard input:5: dispatch of session \"a\" differs from the recording\n"
            "  what      recorded  now\n"
            "  returned  0         1\n"
            "  result    none      {\"timestamp\":3,\"class\":1}\n"
            "  this is the first difference: what follows may come of it\n");
}

TEST(ReplayCheck, CountsCallsWithoutARecordedResult) {
  const ToolRun run = checkText(std::string(kRecording) + R"({"call":"uninit"})");
  EXPECT_EQ(run.out, "6 calls compared, all as recorded; 1 without a recorded result\n");
  EXPECT_EQ(run.status, 0);
}

TEST(ReplayCheck, FailsWhenThereIsNothingToCompare) {
  const ToolRun run = runTool({"replay", "--check", "tapping.jsonl"});
  EXPECT_EQ(run.out, "");
  EXPECT_EQ(run.err, "senseloom: nothing was compared: none of 20 calls has a recorded result to compare with\n");
  EXPECT_EQ(run.status, 1);
}

// The batch of two was half full when the recording began. A session that starts over is in the middle of nothing.
TEST(ReplayCheck, ComparesAResumedSessionOnceItIsKnownHowFarItIs) {
  const std::string start = R"({"call":"open","session":"a","sensor":"PHYAC","resumed":1}
{"call":"set_option","session":"a","option":{"logN":1}}
{"call":"dispatch","session":"a","record":{"hex":"000000000000000001000000"},"returned":1,"result":{"hex":"000000000000000001000000"}}
{"call":"dispatch","session":"a","record":{"hex":"010000000000000001000000"},"returned":0}
)";
  const std::string restart = R"({"call":"set_option","session":"a","option":{"logN":0}}
{"call":"open","session":"b","sensor":"PHYAC","returned":"handle"}
{"call":"close","session":"b","returned":1,"properties":[{"id":41,"size":4,"value":"00000000"},{"id":43,"size":4,"value":"01000100"},{"id":44,"size":4,"value":"01000000"},{"id":42,"size":4,"value":"ffffffff"}]}
{"call":"dispatch","session":"a","record":{"hex":"020000000000000001000000"},"returned":0}
)";
  const ToolRun run = checkText(start + restart);
  EXPECT_NE(run.out.find("standard input:8: dispatch of session \"a\" differs"), std::string::npos) << run.out;
  EXPECT_EQ(run.err, "senseloom: 1 of 3 calls compared differ\n");
  EXPECT_EQ(checkText(start).err,
            "senseloom: nothing was compared: none of 4 calls has a recorded result to compare with\n");
}

TEST(ReplayCheck, SaysThatATraceIsEmpty) {
  const ToolRun run = checkText("\n");
  EXPECT_EQ(run.err,
            "senseloom: standard input: the trace is empty: there is no call in it\n"
            "senseloom: nothing was compared: none of 0 calls has a recorded result to compare with\n");
  EXPECT_EQ(run.status, 1);
  for (const std::vector<std::string>& command :
       {std::vector<std::string>{"replay", "-"}, {"replay", "--json", "-"}, {"explain", "-"}}) {
    EXPECT_EQ(runTool(command).err, "senseloom: standard input: the trace is empty: there is no call in it\n");
  }
}

TEST(ReplayCheck, StopsAtALineThatIsNotACall) {
  const ToolRun run = checkText(std::string(kRecording) + "stop\n");
  EXPECT_EQ(run.out, "");
  EXPECT_EQ(run.err.rfind("senseloom: standard input:8: not JSON: ", 0), 0U) << run.err;
  EXPECT_EQ(run.status, 2);
}

// What each command takes at most, in KiB, that writes or reads a recording of so many records.
std::vector<long> peaksOf(int records) {
  const ScratchFile trace("long_trace");
  const ScratchFile recording("long_recording");
  {
    std::ofstream stream(trace.name);
    stream << R"({"call":"open","session":"a","sensor":"PHYAC"})" << '\n';
    for (int i = 0; i < records; ++i) {
      stream << R"({"call":"dispatch","session":"a","record":{"hex":"510000000000000001005300"}})" << '\n';
    }
  }
  const ToolRun recorded = recordTo(recording.name, {TOOL_FILE, "replay", "--quiet", trace.name});
  EXPECT_EQ(recorded.status, 0);
  const ToolRun checked = check(recording.name);
  EXPECT_EQ(checked.out, std::to_string(records + 2) + " calls compared, all as recorded\n");
  std::vector<long> peaks{recorded.peakKilobytes, checked.peakKilobytes};
  for (const char* command : {"explain", "info"}) {
    const ToolRun run = runTool({command, recording.name});
    EXPECT_EQ(run.status, 0) << run.err;
    peaks.push_back(run.peakKilobytes);
  }
  return peaks;
}

// A recording is written through a window of a megabyte, which counts as memory as far as it was written; the short one
// fills it, too. Pages of shared libraries make up to 200 KiB of difference from one run to the next. The bound is 13
// bytes for each record more.
TEST(ReplayCheck, TakesNoMoreMemoryForALongRecordingThanForAShortOne) {
#ifdef SANITIZED
  GTEST_SKIP() << "the sanitizer itself holds on to freed memory";
#endif
  const std::vector<long> few = peaksOf(20000);
  const std::vector<long> many = peaksOf(100000);
  for (size_t i = 0; i < few.size(); ++i) EXPECT_LT(many[i], few[i] + 1024) << "of command " << i;
}

}  // namespace
}  // namespace senseloom::tool
