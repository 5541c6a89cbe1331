#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>
#include <fstream>
#include <string>
#include <thread>

#include "background_program.h"
#include "recording.h"

namespace senseloom::tool {
namespace {

constexpr char kLines[] =
    "open a PHYAC\nset a {\"logN\":3}\nrepeat a 30\nopen b STAP\nrepeat a 17\nclose b\nrepeat a 23\n";
constexpr size_t kCalls = 2 + 30 + 1 + 17 + 1 + 23;

TEST(RecordFiles, KeepsAFileThatHoldsSomething) {
  const ScratchFile trace("kept");
  std::ofstream(trace.name) << "mine\n";
  const ToolRun run = recordDriven(trace.name, kLines);
  EXPECT_EQ(run.err, "senseloom: " + trace.name + ": the file is not empty; --force replaces it\n");
  EXPECT_EQ(run.out, "");
  EXPECT_EQ(run.status, 2);
  EXPECT_EQ(contentOf(trace.name), "mine\n");
}

TEST(RecordFiles, ReplacesAFileIfItIsForcedTo) {
  const ScratchFile trace("forced");
  std::ofstream(trace.name) << "mine\n";
  EXPECT_EQ(recordDriven(trace.name, kLines, {"--force"}).err, summaryOf(kCalls, trace.name));
  EXPECT_EQ(check(trace.name).status, 0);
}

TEST(RecordFiles, TakesAnEmptyFile) {
  const ScratchFile trace("empty");
  std::ofstream(trace.name).close();
  EXPECT_EQ(recordDriven(trace.name, kLines).status, 0);
  EXPECT_EQ(check(trace.name).status, 0);
}

TEST(RecordFiles, LeavesTheFileOfAProgramThatCannotBeStartedAsItWas) {
  const ScratchFile trace("not_started");
  std::ofstream(trace.name) << "mine\n";
  const ToolRun run = runTool({"record", "--force", "-o", trace.name, "--", "/no/such/program"});
  EXPECT_EQ(run.err, "senseloom: /no/such/program: No such file or directory\n");
  EXPECT_EQ(run.status, 2);
  EXPECT_EQ(contentOf(trace.name), "mine\n");
}

TEST(RecordFiles, RefusesTheFileOfARecordingThatGoesOn) {
  const ScratchFile trace("busy");
  BackgroundProgram first({TOOL_FILE, "record", "-o", trace.name, "--", DRIVEN_FILE}, recordingEnvironment());
  EXPECT_EQ(first.ask("open a LIFT"), "1");
  const ToolRun second = recordDriven(trace.name, kLines, {"--force"});
  EXPECT_EQ(second.err, "senseloom: " + trace.name + ": another recording is written to the file\n");
  EXPECT_EQ(second.status, 2);
  EXPECT_EQ(first.ask("dispatch a 1"), "1");
  EXPECT_EQ(first.finish().err, summaryOf(2, trace.name));
  EXPECT_EQ(check(trace.name).out, "2 calls compared, all as recorded\n");
}

TEST(RecordFiles, GivesEachProcessAFile) {
  const ScratchFolder folder("processes");
  const ToolRun run =
      recordDriven(folder.file("%p.jsonl"), std::string(kLines) + "fork\nrepeat a 20\n", {"--follow-forks"});
  EXPECT_EQ(run.status, 0) << run.err;
  const auto files = folder.files();
  ASSERT_EQ(files.size(), 2U);
  std::string all;
  for (const std::string& file : files) {
    EXPECT_EQ(check(folder.file(file)).err, "") << file;
    const std::string process = file.substr(0, file.find('.'));
    EXPECT_NE(contentOf(folder.file(file)).find(",\"thread\":" + process + ','), std::string::npos) << file;
    all += contentOf(folder.file(file));
  }
  EXPECT_NE(all.find(R"({"call":"open","session":"s1","sensor":"PHYAC"})"), std::string::npos) << "the child's start";
}

TEST(RecordFiles, NeedsNamesThatDifferToFollowForks) {
  const ToolRun run = runTool({"record", "--follow-forks", "-o", "trace", "--", DRIVEN_FILE});
  EXPECT_EQ(run.err, "senseloom: trace: to follow forks, the name needs a %p: each process has a file of its own\n");
  EXPECT_EQ(run.status, 2);
}

// Each part ends in the middle of a batch of eight.
TEST(RecordFiles, MakesPartsThatReplayAlone) {
  const ScratchFolder folder("parts");
  const ToolRun run = recordDriven(folder.file("trace.jsonl"), kLines, {"--max-size", "4k"});
  EXPECT_EQ(run.status, 0) << run.err;
  const auto files = folder.files();
  EXPECT_GE(files.size(), 4U);
  EXPECT_EQ(files.front(), "trace.2.jsonl");
  size_t compared = 0;
  for (const std::string& file : files) {
    const ToolRun checked = check(folder.file(file));
    EXPECT_EQ(checked.status, 0) << file << checked.out << checked.err;
    EXPECT_EQ(checked.err, "");
    compared += std::stoul(checked.out);
    EXPECT_LT(contentOf(folder.file(file)).size(), 4096U + 300) << file;
  }
  EXPECT_EQ(compared, kCalls);
}

// Parts end between the dispatches of a record to three sessions, of which the first has the gesture engine asked.
TEST(RecordFiles, MakesPartsThatHoldWhatTheGestureEngineAnswered) {
  const ScratchFolder folder("gesture_parts");
  std::string calls;
  for (const char* session : {"a", "b", "c"}) {
    calls += std::string(R"({"call":"open","session":")") + session + R"(","sensor":"GSPX"}
{"call":"set_option","session":")" +
             session + R"(","option":{"classMask":-1}}
)";
  }
  for (int time = 1; time <= 60; ++time) {
    calls += R"({"call":"dispatch","sensor":"GSPX","record":{"timestamp":)" + std::to_string(time) +
             R"(,"prx":0,"samples":[[1,2,3,4,5,6]]},"engine":[{"group":0,"name":")" +
             (time % 2 == 0 ? "LetterA " : "LetterB ") + "\"}]}\n";
  }
  runTool({"record", "--max-size", "3k", "-o", folder.file("trace.jsonl"), "--", TOOL_FILE, "replay", "--quiet", "-"},
          calls, recordingEnvironment());
  EXPECT_GE(folder.files().size(), 10U);
  for (const std::string& file : folder.files())
    EXPECT_EQ(check(folder.file(file)).out.find("differs"), std::string::npos) << file;
}

TEST(RecordFiles, LeavesThePartsOfAnEarlierRecordingAlone) {
  const ScratchFolder folder("old_parts");
  std::ofstream(folder.file("trace.2.jsonl")) << "mine\n";
  recordDriven(folder.file("trace.jsonl"), kLines, {"--max-size", "8k"});
  EXPECT_EQ(folder.files(), (std::vector<std::string>{"trace.2.jsonl", "trace.3.jsonl", "trace.jsonl"}));
  EXPECT_EQ(contentOf(folder.file("trace.2.jsonl")), "mine\n");
}

class CompressedRecording : public testing::TestWithParam<std::string> {};

TEST_P(CompressedRecording, IsReadByEveryCommand) {
  const ScratchFolder folder("compressed");
  const std::string file = folder.file("trace.jsonl." + GetParam());
  EXPECT_EQ(recordDriven(file, kLines).err, summaryOf(kCalls, file));
  EXPECT_EQ(folder.files().size(), 1U);
  const std::string compressed = contentOf(file);
  EXPECT_EQ(compressed.find("dispatch"), std::string::npos);
  EXPECT_EQ(check(file).out, std::to_string(kCalls) + " calls compared, all as recorded\n");
  EXPECT_EQ(runTool({"explain", file}).status, 0);
  EXPECT_EQ(runTool({"explain", "-"}, compressed).status, 0);
}

TEST_P(CompressedRecording, HasPartsThatReplayAlone) {
  const ScratchFolder folder("compressed_parts");
  recordDriven(folder.file("trace.jsonl." + GetParam()), kLines, {"--max-size", "8k"});
  EXPECT_EQ(folder.files(), (std::vector<std::string>{"trace.2.jsonl." + GetParam(), "trace.jsonl." + GetParam()}));
  for (const std::string& name : folder.files()) EXPECT_EQ(check(folder.file(name)).status, 0) << name;
}

TEST_P(CompressedRecording, IsLeftWholeByAnotherOneToTheSameFile) {
  const ScratchFolder folder("compressed_busy");
  const std::string file = folder.file("trace.jsonl." + GetParam());
  BackgroundProgram first({TOOL_FILE, "record", "-o", file, "--", DRIVEN_FILE}, recordingEnvironment());
  EXPECT_EQ(first.ask("open a LIFT"), "1");
  const ToolRun second = recordDriven(file, kLines, {"--force"});
  EXPECT_EQ(second.err, "senseloom: " + file + ".part: cannot be written: another program writes it\n");
  EXPECT_EQ(second.status, 2);
  EXPECT_EQ(first.finish().err, summaryOf(1, file));
  EXPECT_EQ(check(file).out, "1 calls compared, all as recorded\n");
}

TEST_P(CompressedRecording, LeavesAnUnfinishedOneAlone) {
  const ScratchFolder folder("compressed_rest");
  const std::string file = folder.file("trace.jsonl." + GetParam());
  std::ofstream(file + ".part") << "mine\n";
  const ToolRun run = recordDriven(file, kLines, {"--force"});
  EXPECT_EQ(run.err, "senseloom: " + file + ".part: cannot be written: it holds what was left unfinished\n");
  EXPECT_EQ(run.status, 2);
  EXPECT_EQ(contentOf(file + ".part"), "mine\n");
}

TEST_P(CompressedRecording, IsWholeWhenTheProgramWasKilled) {
  const ScratchFolder folder("compressed_killed");
  const std::string file = folder.file("trace.jsonl." + GetParam());
  EXPECT_EQ(recordDriven(file, "open a LIFT\nrepeat a 1000\nsignal 9\n").status, -1);
  const ToolRun checked = check(file);
  EXPECT_EQ(checked.out, "1001 calls compared, all as recorded\n");
  EXPECT_NE(checked.err.find(":1003: the program was ended by a signal: Killed\n"), std::string::npos) << checked.err;
}

TEST_P(CompressedRecording, TellsThatItWasCutShort) {
  const ScratchFolder folder("compressed_cut");
  const std::string file = folder.file("trace.jsonl." + GetParam());
  recordDriven(file, kLines);
  const auto size = std::filesystem::file_size(file);
  std::filesystem::resize_file(file, size - 12);
  const ToolRun cut = check(file);
  EXPECT_NE(cut.err.find(": the compressed data is cut short\n"), std::string::npos) << cut.err;
  EXPECT_EQ(cut.status, 2);
  std::fstream(file, std::ios::in | std::ios::out).seekp(8).write("\xff\xff\xff\xff\xff\xff\xff\xff", 8);
  const ToolRun damaged = check(file);
  EXPECT_NE(damaged.err.find("the compressed data is damaged: "), std::string::npos) << damaged.err;
  EXPECT_EQ(damaged.status, 2);
}

INSTANTIATE_TEST_SUITE_P(All, CompressedRecording, testing::Values("gz", "zst"),
                         [](const auto& kind) { return kind.param; });

TEST(RecordFiles, WritesToStandardOutputAndTheProgramToStandardError) {
  const ToolRun run = recordDriven("-", "open a LIFT\n");
  EXPECT_EQ(callsOf(run.out), R"({"call":"open","session":"s1","sensor":"LIFT","returned":"handle"})"
                              "\n");
  EXPECT_EQ(run.err, "1\n" + summaryOf(1, "standard output"));
}

TEST(RecordFiles, PassesLinesOnAsTheyCome) {
  BackgroundProgram tool({"/bin/sh", "-c", "exec '" TOOL_FILE "' record -o - -- '" DRIVEN_FILE "'"},
                         recordingEnvironment());
  EXPECT_EQ(tool.ask("open a LIFT").rfind(R"({"format":1,)", 0), 0U);
  EXPECT_EQ(callsOf(tool.readLine()), R"({"call":"open","session":"s1","sensor":"LIFT","returned":"handle"})");
  EXPECT_EQ(tool.ask("dispatch a 1").rfind(R"({"call":"dispatch")", 0), 0U);
  EXPECT_EQ(tool.finish().status, 0);
}

TEST(RecordFiles, WritesToANamedPipe) {
  const ScratchFile pipe("named_pipe");
  ASSERT_EQ(mkfifo(pipe.name.c_str(), 0600), 0);
  std::string content;
  std::thread reader([&] { content = contentOf(pipe.name); });
  EXPECT_EQ(recordDriven(pipe.name, "open a LIFT\nclose a\n").status, 0);
  reader.join();
  EXPECT_EQ(callsOf(content), R"({"call":"open","session":"s1","sensor":"LIFT","returned":"handle"}
{"call":"close","session":"s1","returned":0}
)");
}

// The program goes on when nobody reads its recording any more.
TEST(RecordFiles, LeavesTheProgramAloneWhenThePipeIsClosed) {
  const ScratchFile errors("closed_pipe");
  const std::string record =
      "{ '" TOOL_FILE "' record -o - -- '" DRIVEN_FILE "' 2>'" + errors.name + "'; echo $? >&2; }";
  BackgroundProgram tool({"/bin/sh", "-c", record + " | head -n 1"}, recordingEnvironment());
  tool.tell("open a LIFT");
  EXPECT_EQ(tool.readLine().rfind(R"({"format":1,)", 0), 0U);
  tool.tell("repeat a 10000\ndispatch a 5");
  EXPECT_EQ(tool.finish().err, "1\n");
  EXPECT_EQ(contentOf(errors.name), "1\n10000\n1\nsenseloom: the recording cannot be written: Broken pipe\n");
}

TEST(RecordFiles, RefusesThePipeOfARecordingThatGoesOn) {
  const ScratchFile pipe("busy_pipe");
  ASSERT_EQ(mkfifo(pipe.name.c_str(), 0600), 0);
  const std::fstream reader(pipe.name);  // writes, too, so it does not wait for the other end
  BackgroundProgram first({TOOL_FILE, "record", "-o", pipe.name, "--", DRIVEN_FILE}, recordingEnvironment());
  EXPECT_EQ(first.ask("open a LIFT"), "1");
  const ToolRun second = recordDriven(pipe.name, kLines);
  EXPECT_EQ(second.err, "senseloom: " + pipe.name + ": another recording is written to it\n");
  EXPECT_EQ(second.status, 2);
  EXPECT_EQ(first.finish().status, 0);
}

}  // namespace
}  // namespace senseloom::tool
