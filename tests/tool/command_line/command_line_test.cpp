#include <gtest/gtest.h>

#include <cstdlib>
#include <sstream>
#include <string>

#include "run_tool.h"

namespace senseloom::tool {
namespace {

TEST(CommandLine, PrintsTheVersion) {
  const ToolRun run = runTool({"--version"});
  EXPECT_EQ(run.out, "senseloom " SENSELOOM_VERSION "\n");
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.status, 0);
}

TEST(CommandLine, HelpsWithEveryCommand) {
  EXPECT_NE(runTool({"--help"}).out.find("replay"), std::string::npos);
  EXPECT_NE(runTool({"replay", "--help"}).out.find("--quiet"), std::string::npos);
  EXPECT_NE(runTool({"record", "--help"}).out.find("-o,--output"), std::string::npos);
  EXPECT_NE(runTool({"generate", "--help"}).out.find("commute"), std::string::npos);
  EXPECT_NE(runTool({"generate", "commute", "--help"}).out.find("--seed"), std::string::npos);
  EXPECT_NE(runTool({"sensors", "--help"}).out.find("SENSOR"), std::string::npos);
  EXPECT_EQ(runTool({"replay", "--help"}).status, 0);
}

TEST(CommandLine, RefusesWhatItDoesNotUnderstandWithStatus2) {
  const std::vector<std::vector<std::string>> lines = {
      {},
      {"relay"},
      {"replay"},
      {"replay", "a", "b"},
      {"replay", "--jsn", "lift.jsonl"},
      {"replay", "--json", "--quiet", "lift.jsonl"},
      {"replay", "--all", "--quiet", "lift.jsonl"},
      {"replay", "--all", "--json", "lift.jsonl"},
      {"replay", "--check", "--all", "lift.jsonl"},
      {"replay", "--check", "--quiet", "lift.jsonl"},
      {"replay", "--log", "loud", "lift.jsonl"},
      {"record"},
      {"record", "--"},
      {"watch"},
      {"watch", "--"},
      {"watch", "a.jsonl", "b.jsonl"},
      {"status"},
      {"status", "self"},
      {"generate"},
      {"generate", "commute"},
      {"generate", "commute", "--seed", "-1"},
      {"generate", "commute", "--seed", "one"},
      {"generate", "commute", "--seed", "1", "--records", "-1"},
      {"sensors", "STAP", "LIFT"},
  };
  for (const auto& line : lines) {
    const ToolRun run = runTool(line);
    EXPECT_EQ(run.out, "");
    EXPECT_NE(run.err, "");
    EXPECT_EQ(run.status, 2) << testing::PrintToString(line);
  }
}

// The message about a command line, but for its second line, which tells of --help.
std::string errorOf(const std::vector<std::string>& line) {
  const ToolRun run = runTool(line);
  EXPECT_EQ(run.status, 2);
  const size_t end = run.err.find('\n');
  EXPECT_NE(run.err.find(" --help tells what can be given.\n", end), std::string::npos) << run.err;
  return run.err.substr(0, end);
}

TEST(CommandLine, NamesWhatIsUnknownWithTheNearestThatIsKnown) {
  EXPECT_EQ(errorOf({"relay"}), "senseloom has no command \"relay\"; the nearest is \"replay\"");
  EXPECT_EQ(errorOf({"replay", "--jsn", "lift.jsonl"}),
            "senseloom replay has no option \"--jsn\"; the nearest is \"--json\"");
  EXPECT_EQ(errorOf({"replay", "--plott=x.svg", "lift.jsonl"}),
            "senseloom replay has no option \"--plott\"; the nearest is \"--plot\"");
  EXPECT_EQ(errorOf({"generate", "comute", "--seed", "1"}),
            "senseloom generate has no command \"comute\"; the nearest is \"commute\"");
  EXPECT_EQ(errorOf({"--verison"}), "senseloom has no option \"--verison\"; the nearest is \"--version\"");
  EXPECT_EQ(errorOf({"replay", "a", "b"}), "senseloom replay: \"b\" is one argument too many");
  EXPECT_EQ(errorOf({"replay", "--log", "warm", "a"}),
            "senseloom replay: --log: \"warm\" is none of debug, info, warn, error, none; the nearest is warn");
}

TEST(CommandLine, SaysWhichNumbersCanBeGiven) {
  const std::string seed = "senseloom generate commute: --seed: ";
  EXPECT_EQ(errorOf({"generate", "commute", "--seed", "-1"}),
            seed + "\"-1\" is not a whole number from 0 to 18446744073709551615");
  EXPECT_EQ(errorOf({"generate", "commute", "--seed", "1x"}),
            seed + "\"1x\" is not a whole number from 0 to 18446744073709551615");
  EXPECT_EQ(errorOf({"generate", "commute", "--seed", "1", "--records", "4294967296"}),
            "senseloom generate commute: --records: \"4294967296\" is not a whole number from 0 to 4294967295");
  EXPECT_EQ(errorOf({"sweep", "a", "--session", "b", "--set", "logN=1", "--at-most-false", "few"}),
            "senseloom sweep: --at-most-false: \"few\" is not a number from 0 on, such as 12 or 0.5");
}

TEST(CommandLine, HelpsInAtMost80Columns) {
  const std::vector<std::vector<std::string>> commands = {{},
                                                          {"replay"},
                                                          {"explain"},
                                                          {"record"},
                                                          {"status"},
                                                          {"info"},
                                                          {"diff"},
                                                          {"trim"},
                                                          {"sweep"},
                                                          {"generate"},
                                                          {"generate", "commute"},
                                                          {"convert"},
                                                          {"sensors"}};
  for (std::vector<std::string> command : commands) {
    command.emplace_back("--help");
    std::istringstream lines(runTool(command).out);
    for (std::string line; std::getline(lines, line);) EXPECT_LE(line.size(), 80U) << line;
  }
}

TEST(CommandLine, HelpSaysHowOptionsGoTogether) {
  const std::string explain = runTool({"explain", "--help"}).out;
  EXPECT_NE(explain.find("\n"
                         "  --problems              print nothing but what was rejected, refused or lost,\n"
                         "                          and what is unexplained (not with --all, --records)\n"),
            std::string::npos)
      << explain;
  const std::string replay = runTool({"replay", "--help"}).out;
  EXPECT_NE(replay.find("\n"
                        "  --log LEVEL             print log lines from this level on, on standard error:\n"
                        "                          debug,info,warn,error,none (warn if not given)\n"),
            std::string::npos)
      << replay;
}

TEST(CommandLine, ChoosesCallsWithTheSameWordsInEveryCommand) {
  const std::string replay = runTool({"replay", "--help"}).out;
  const size_t start = replay.find("  --time-unit UNIT");
  const std::string words = replay.substr(start, replay.find("  --follow") - start);
  for (const char* option :
       {"--session NAME", "--sensor SENSOR", "--from LINE or TIME", "--to LINE or TIME", "--failed"}) {
    EXPECT_NE(words.find(option), std::string::npos) << words;
  }
  for (const char* command : {"explain", "view", "watch", "info", "diff", "trim"}) {
    EXPECT_NE(runTool({command, "--help"}).out.find(words), std::string::npos) << command;
  }
}

TEST(CommandLine, ReportsOutputThatCannotBeWrittenWithStatus1) {
  EXPECT_EQ(std::system("exec 2>/dev/null >/dev/full; '" TOOL_FILE "' sensors"), 1 << 8);
  EXPECT_EQ(std::system("exec 2>/dev/null >&-; '" TOOL_FILE "' sensors"), 1 << 8);
}

}  // namespace
}  // namespace senseloom::tool
