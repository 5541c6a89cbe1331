#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>

#include <filesystem>
#include <fstream>
#include <string>

#include "background_program.h"
#include "recording.h"

namespace senseloom::tool {
namespace {

const std::vector<std::string> kReplay{"replay", "--log", "warn", "--quiet", "-"};
const std::string kOpen = R"({"call":"open","session":"a","sensor":"LIFT"})"
                          "\n";
const std::string kDispatch = R"({"call":"dispatch","session":"a","record":{"hex":"01000000000000000200"}})"
                              "\n";

// What is recorded of them, and of the closing at the end.
const std::string kOpenLine = R"({"call":"open","session":"s1","sensor":"LIFT","returned":"handle"})"
                              "\n";
const std::string kDispatchLine = R"({"call":"dispatch","session":"s1","record":{"hex":"01000000000000000200"},)"
                                  R"("returned":1,"result":{"hex":"01000000000000000200"}})"
                                  "\n";
const std::string kCloseLine = R"({"call":"close","session":"s1","returned":0})"
                               "\n";

// Runs the tool with the recording set up by hand.
ToolRun runTraced(const std::string& file, const std::vector<std::string>& arguments, const std::string& input) {
  Environment environment = recordingEnvironment();
  environment.emplace_back("LD_AUDIT", AUDIT_LIBRARY);
  environment.emplace_back("SENSELOOM_TRACE", file);
  return runTool(arguments, input, environment);
}

TEST(TraceLibrary, WritesWhatATraceCannotSayAsNotes) {
  const ScratchFile trace("refused");
  EXPECT_EQ(recordTo(trace.name, {REFUSED_CALLS_FILE}).status, 0);
  EXPECT_EQ(callsOf(contentOf(trace.name)),
            R"({"note":"open of a sensor that does not exist","sensor":null,"returned":null})"
            "\n"
            R"({"note":"open of a sensor that does not exist","sensorHex":"54c450","returned":null})"
            "\n" +
                kOpenLine +
                R"({"note":"set_option on a handle that is not open","returned":-1}
{"note":"set_option on a handle that is not open","returned":-1}
{"note":"set_option without an argument","returned":-1}
{"call":"set_option","session":"s1","option":null,"returned":-1}
{"call":"set_option","session":"s1","option":"\"\u0009\\","returned":-1}
{"call":"set_option","session":"s1","optionHex":"7b22ff223a317d","returned":-1}
{"call":"set_option","session":"s1","optionHex":"7b22c3a4223a317d","returned":0,"properties":[{"id":201,"size":4,"value":"03000000"}],"list":1}
{"note":"dispatch on a handle that is not open","returned":-1}
{"note":"dispatch without an argument","returned":-1}
{"note":"dispatch without an argument","returned":-1}
{"note":"dispatch without an argument","returned":-1}
{"note":"dispatch without an argument","returned":-1}
{"call":"dispatch","session":"s1","record":{"hex":""},"returned":1,"result":{"hex":""}}
)" + kDispatchLine +
                R"({"note":"close on a handle that is not open","returned":-1}
{"note":"close without an argument","returned":-1}
)" + kCloseLine +
                R"({"note":"close on a handle that is not open","returned":-1}
{"call":"uninit"}
)");
  EXPECT_EQ(check(trace.name).out, "8 calls compared, all as recorded; 1 without a recorded result\n");
}

TEST(TraceLibrary, RecordsASessionThatDidNotOpen) {
  const ScratchFile trace("no_audio");
  const std::string open = R"({"call":"open","session":"a","sensor":"LPE_P"})"
                           "\n";
  recordTo(trace.name, {TOOL_FILE, "replay", "-"}, open + open, {{"SENSELOOM_AWARE_FAIL_ACTIVATE", "1"}});
  EXPECT_EQ(callsOf(contentOf(trace.name)), R"({"call":"open","session":"s1","sensor":"LPE_P","returned":null}
{"call":"open","session":"s2","sensor":"LPE_P","returned":null}
)");
}

TEST(TraceLibrary, CreatesTheFileForItsOwnerAlone) {
  const ScratchFile trace("new");
  EXPECT_EQ(runTraced(trace.name, kReplay, kOpen + kDispatch).err, "");
  EXPECT_EQ(callsOf(contentOf(trace.name)), kOpenLine + kDispatchLine + kCloseLine);
  struct stat file {};
  ASSERT_EQ(stat(trace.name.c_str(), &file), 0);
  EXPECT_EQ(file.st_mode & 0777, 0600U);
}

TEST(TraceLibrary, LeavesTheFileAloneWithoutACall) {
  const ScratchFile trace("unused");
  EXPECT_EQ(runTraced(trace.name, {"--version"}, "").err, "");
  EXPECT_FALSE(std::filesystem::exists(trace.name));
}

TEST(TraceLibrary, DoesNothingWithoutAFile) {
  Environment environment = recordingEnvironment();
  environment.emplace_back("LD_AUDIT", AUDIT_LIBRARY);
  const ToolRun run = runTool(kReplay, kOpen + kDispatch, environment);
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.status, 0);
}

// The program does what it does without a recording.
void expectUndisturbed(const ToolRun& run, const std::string& reason, const std::string& missing) {
  EXPECT_EQ(run.out,
            "session  sensor    opened   records   results    failed\n"
            "a        LIFT           1         1         1         0\n");
  EXPECT_EQ(run.status, 0);
  EXPECT_NE(run.err.find("calls are not recorded: " + reason + "\n"), std::string::npos) << run.err;
  EXPECT_NE(run.err.find("lines missing at the end of the trace: " + missing + "\n"), std::string::npos) << run.err;
}

TEST(TraceLibrary, DoesNotDisturbAProgramWhenTheDiskIsFull) {
  expectUndisturbed(runTraced("/dev/full", kReplay, kOpen + kDispatch), "No space left on device", "3");
}

TEST(TraceLibrary, DoesNotDisturbAProgramWhenTheFileCannotBeWritten) {
  expectUndisturbed(runTraced("/no/such/folder/trace", kReplay, kOpen + kDispatch), "No such file or directory", "3");
  expectUndisturbed(runTraced("/", kReplay, kOpen + kDispatch), "Is a directory", "3");
}

TEST(TraceLibrary, DoesNotWaitForAPipeToBeOpened) {
  const ScratchFile pipe("pipe");
  ASSERT_EQ(mkfifo(pipe.name.c_str(), 0600), 0);
  expectUndisturbed(runTraced(pipe.name, kReplay, kOpen + kDispatch), "No such device or address", "3");
}

// The pipe takes 64 KiB.
TEST(TraceLibrary, GivesAReaderUpThatDoesNotRead) {
  const ScratchFile pipe("stuck");
  ASSERT_EQ(mkfifo(pipe.name.c_str(), 0600), 0);
  const std::fstream reader(pipe.name);  // writes, too, so it does not wait for the other end
  std::string calls = kOpen;
  for (int i = 0; i < 1000; ++i) calls += kDispatch;
  const ToolRun run = runTraced(pipe.name, kReplay, calls);
  EXPECT_EQ(run.status, 0);
  EXPECT_NE(run.err.find("calls are not recorded: nobody reads the pipe\n"), std::string::npos) << run.err;
}

TEST(TraceLibrary, LeavesThePipeToTheProcessThatWasFirst) {
  const ScratchFile pipe("shared");
  ASSERT_EQ(mkfifo(pipe.name.c_str(), 0600), 0);
  const std::fstream reader(pipe.name);
  Environment environment = recordingEnvironment();
  environment.emplace_back("LD_AUDIT", AUDIT_LIBRARY);
  environment.emplace_back("SENSELOOM_TRACE", pipe.name);
  BackgroundProgram first({DRIVEN_FILE}, environment);
  EXPECT_EQ(first.ask("open a LIFT"), "1");
  expectUndisturbed(runTraced(pipe.name, kReplay, kOpen + kDispatch), "another recording is written to the file", "3");
}

TEST(TraceLibrary, KeepsTheTraceThatTheFileHolds) {
  const ScratchFile trace("kept");
  std::ofstream(trace.name) << kOpenLine;
  expectUndisturbed(runTraced(trace.name, kReplay, kOpen + kDispatch), "the file is not empty", "3");
  EXPECT_EQ(contentOf(trace.name), kOpenLine);
}

// The limit stands in for a disk that is full for a while: a shorter line still has room after a longer one had none.
TEST(TraceLibrary, NotesHowManyLinesAreMissing) {
  const ScratchFile trace("limited");
  const std::string longCall = "set a " + std::string(2500, 'x') + "\n";
  const ToolRun run = recordDriven(
      trace.name, "limit 4096\nopen a LIFT\n" + longCall + longCall + longCall + "dispatch a 2\nclose a\n");

  EXPECT_EQ(run.status, 0);
  EXPECT_NE(run.err.find("senseloom: 2 lines could not be recorded: File too large\n"), std::string::npos) << run.err;
  // Behind each there is room for the release of what the call returned, NULL.
  const std::string missing = R"({"note":"lines missing here: 1","why":"File too large"})"
                              "\n";
  EXPECT_EQ(callsOf(contentOf(trace.name)),
            kOpenLine + R"({"call":"set_option","session":"s1","option":")" + std::string(2500, 'x') +
                "\",\"returned\":-1}\n" + missing + missing +
                R"({"call":"dispatch","session":"s1","record":{"hex":"020000000000000001000200"},"returned":1,)"
                R"("result":{"hex":"020000000000000001000200"}})"
                "\n" +
                kCloseLine);
  const ToolRun checked = check(trace.name);
  EXPECT_EQ(checked.status, 0);
  EXPECT_NE(checked.err.find(": 2 lines could not be recorded: File too large\n"), std::string::npos) << checked.err;
}

// A child that was forked is not recorded. A descriptor that the program closed and took for itself is not written to.
TEST(TraceLibrary, RecordsNoChildAndGoesOnWithoutItsDescriptor) {
  const ScratchFile trace("service");
  const ScratchFile own("own");
  const ToolRun run = recordTo(trace.name, {SERVICE_FILE, own.name});
  EXPECT_EQ(run.status, 0);
  EXPECT_EQ(contentOf(own.name), "own\n");
  const std::string content = contentOf(trace.name);
  EXPECT_EQ(callsOf(content).rfind(kOpenLine, 0), 0U) << content;
  EXPECT_EQ(content.find(R"("hex":"02)"), std::string::npos) << content;
  EXPECT_NE(content.find(R"("hex":"03)"), std::string::npos) << content;
  EXPECT_NE(content.find(R"("hex":"04)"), std::string::npos) << content;
  EXPECT_EQ(content.find('\0'), std::string::npos);
  EXPECT_EQ(run.err, summaryOf(5, trace.name));
}

}  // namespace
}  // namespace senseloom::tool
