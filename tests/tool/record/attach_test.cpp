#include <gtest/gtest.h>
#include <unistd.h>

#include <csignal>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <string>
#include <thread>

#include "background_program.h"
#include "recording.h"

namespace senseloom::tool {
namespace {

Environment notRecording() {
  Environment environment = recordingEnvironment();
  environment.emplace_back("LD_AUDIT", AUDIT_LIBRARY);
  return environment;
}

// The memory that the program can be looked into and given orders by.
std::string memoryOf(const BackgroundProgram& program) {
  for (const auto& entry : std::filesystem::directory_iterator("/proc/" + std::to_string(program.id()) + "/fd")) {
    if (std::filesystem::read_symlink(entry) == "/memfd:senseloom-control (deleted)") return entry.path();
  }
  ADD_FAILURE() << "no control memory";
  return "";
}

ToolRun statusOf(const BackgroundProgram& program) {
  return runTool({"status", std::to_string(program.id())});
}

// Waits until the program is told to record, which it learns with its next call.
void waitForOrder(const BackgroundProgram& program) {
  const std::string memory = memoryOf(program);
  while (contentOf(memory).compare(0, 6, "record") != 0) std::this_thread::yield();
}

TEST(Attach, RecordsARunningProcessUntilItIsInterrupted) {
  const ScratchFile trace("attached");
  BackgroundProgram program({DRIVEN_FILE}, notRecording());
  for (const char* line : {"open a PHYAC", "set a {\"logN\":3}", "set a {\"logN\":2}", "open b STAP", "repeat a 5"}) {
    program.ask(line);
  }
  BackgroundProgram tool({TOOL_FILE, "record", "--attach", std::to_string(program.id()), "-o", trace.name});
  waitForOrder(program);
  program.ask("repeat a 10");
  program.ask("dispatch b 1");
  tool.send(SIGINT);
  while (program.ask("dispatch b 1") == "1" && statusOf(program).out.find("not recorded") == std::string::npos) {
  }
  const ToolRun attached = tool.finish();
  EXPECT_EQ(attached.status, 0) << attached.err;
  EXPECT_NE(attached.err.find(" calls recorded in " + trace.name), std::string::npos) << attached.err;
  EXPECT_EQ(callsOf(contentOf(trace.name))
                .rfind(R"({"call":"open","session":"s1","sensor":"PHYAC","resumed":1}
{"call":"set_option","session":"s1","option":"{\"logN\":3}"}
{"call":"set_option","session":"s1","option":"{\"logN\":2}"}
{"call":"open","session":"s2","sensor":"STAP"}
)",
                       0),
            0U);
  const ToolRun checked = check(trace.name);
  EXPECT_EQ(checked.status, 0) << checked.out;
  EXPECT_NE(checked.out.find("of sessions in the middle of a batch not compared"), std::string::npos) << checked.out;
}

TEST(Attach, EndsWithTheProcess) {
  const ScratchFile trace("attached_end");
  BackgroundProgram program({DRIVEN_FILE}, notRecording());
  program.ask("open a LIFT");
  BackgroundProgram tool({TOOL_FILE, "record", "--attach", std::to_string(program.id()), "-o", trace.name + ".gz"});
  waitForOrder(program);
  program.ask("dispatch a 1");
  program.send(SIGKILL);
  EXPECT_EQ(tool.finish().status, 0);
  EXPECT_EQ(check(trace.name + ".gz").out, "1 calls compared, all as recorded; 1 without a recorded result\n");
  std::remove((trace.name + ".gz").c_str());
}

TEST(Attach, RefusesWhatCannotBeRecorded) {
  const ScratchFile trace("refused_attach");
  const ToolRun gone = runTool({"record", "--attach", "999999999", "-o", trace.name});
  EXPECT_EQ(gone.err, "senseloom: there is no process 999999999\n");
  EXPECT_EQ(gone.status, 2);
  const ToolRun other = runTool({"record", "--attach", std::to_string(getpid()), "-o", trace.name});
  EXPECT_EQ(other.err.rfind("senseloom: process " + std::to_string(getpid()) +
                                " has not called libsenseloom through the recording library",
                            0),
            0U)
      << other.err;
  EXPECT_EQ(other.status, 2);

  BackgroundProgram recorded({TOOL_FILE, "record", "-o", trace.name, "--", DRIVEN_FILE}, recordingEnvironment());
  recorded.ask("open a LIFT");
  const std::string id =
      contentOf("/proc/" + std::to_string(recorded.id()) + "/task/" + std::to_string(recorded.id()) + "/children");
  const ToolRun twice = runTool({"record", "--attach", std::to_string(std::stoi(id)), "-o", trace.name + ".2"});
  EXPECT_EQ(twice.err, "senseloom: process " + std::to_string(std::stoi(id)) + " is being recorded already\n");
  EXPECT_EQ(twice.status, 2);
  recorded.finish();
}

TEST(Attach, ObeysOrdersThatAShellWrites) {
  const ScratchFile trace("by_shell");
  BackgroundProgram program({DRIVEN_FILE}, notRecording());
  program.ask("open a LIFT");
  const std::string memory = memoryOf(program);
  const auto order = [&](const std::string& text) {
    std::fstream(memory, std::ios::in | std::ios::out) << text << '\n' << std::flush;
    program.ask("dispatch a 1");
    std::string answer;
    std::getline(std::ifstream(memory) >> std::ws, answer);
    return answer;
  };
  EXPECT_EQ(order("recall " + trace.name), "no: neither \"off\" nor \"record FILE\"");
  EXPECT_EQ(order("record /no/such/folder/trace"), "no: /no/such/folder/trace: No such file or directory");
  EXPECT_EQ(order("record " + trace.name), "ok: recording in " + trace.name);
  EXPECT_EQ(order("record " + trace.name), "no: it is being recorded in " + trace.name);
  EXPECT_EQ(order("off"), "ok: off");
  // A session without a record before was in the middle of nothing.
  EXPECT_EQ(check(trace.name).out, "2 calls compared, all as recorded; 1 without a recorded result\n");
}

TEST(Attach, KnowsTheListsThatWereGivenBefore) {
  const ScratchFile trace("attached_lists");
  BackgroundProgram program({DRIVEN_FILE}, notRecording());
  for (const char* line : {"open a LIFT", "keep a {}", "keep a {}", "drop 1"}) program.ask(line);
  std::fstream(memoryOf(program), std::ios::in | std::ios::out) << "record " << trace.name << '\n' << std::flush;
  for (const char* line : {"keep a {}", "drop 2", "close a"}) program.ask(line);
  program.finish();
  const std::string content = contentOf(trace.name);
  EXPECT_NE(content.find(R"(,"list":3,)"), std::string::npos) << content;
  EXPECT_NE(content.find(R"({"call":"release","list":2,)"), std::string::npos) << content;
  const std::string told = runTool({"info", trace.name}).out;
  EXPECT_NE(told.find("lists: 1 given, 0 released\n"), std::string::npos) << told;
  EXPECT_EQ(told.find("no recorded call gave"), std::string::npos) << told;
}

TEST(Status, PrintsWhatIsInForce) {
  BackgroundProgram program({DRIVEN_FILE}, notRecording());
  for (const char* line : {"open a STAP", "open b STAP", "set a {\"classMask\":1}", "set b {\"level\":-2}", "set b [",
                           "open c PHYAC", "repeat a 8", "open d LIFT", "close d"}) {
    program.ask(line);
  }
  const ToolRun run = statusOf(program);
  EXPECT_EQ(run.out, "process " + std::to_string(program.id()) + ", " DRIVEN_FILE R"(, not recorded

STAP: 101 classMask=3, 102 level=-2
  session  records  results  asks for
  s1       8        8        {"classMask":1}
  s2       0        0        {"level":-2}

PHYAC: nothing negotiated
  session  records  results  asks for
  s3       0        0        its default
)");
  EXPECT_EQ(run.status, 0);
}

TEST(Status, PrintsWhatIsInForceAfterManyChanges) {
  BackgroundProgram program({DRIVEN_FILE}, notRecording());
  program.ask("open a SCOUN");
  for (int i = 1; i <= 1000; ++i) program.ask("set a {\"logN\":" + std::to_string(i % 100 + 1) + "}");
  EXPECT_NE(statusOf(program).out.find("SCOUN: 141 mode=1, 142 logN=1\n"
                                       "  session  records  results  asks for\n"
                                       "  s1       0        0        {\"logN\":1}\n"),
            std::string::npos);
}

}  // namespace
}  // namespace senseloom::tool
