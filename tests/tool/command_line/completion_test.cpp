#include <gtest/gtest.h>

#include <cstdlib>
#include <sstream>
#include <string>

#include "recording.h"

namespace senseloom::tool {
namespace {

// What a command line of the shell prints.
std::string printedBy(const std::string& command) {
  const ScratchFile printed("printed_by_shell");
  EXPECT_EQ(std::system((command + " >'" + printed.name + "'").c_str()), 0) << command;
  return contentOf(printed.name);
}

// What each shell offers for the last of these words behind the tool's name, one candidate a line.
std::string offeredByBash(const std::string& words) {
  return printedBy("bash -c '. \"" COMPLETION_FOLDER "/senseloom.bash\"; COMP_WORDS=(\"" TOOL_FILE "\" " + words +
                   "); COMP_CWORD=$((${#COMP_WORDS[@]} - 1)); _senseloom; printf \"%s\\n\" \"${COMPREPLY[@]}\"'");
}
std::string offeredByZsh(const std::string& words) {
  return printedBy(
      "zsh -fc 'compdef() { }; _describe() { print -lr -- \"${(@P)2}\"; }; _files() { print FILES $*; };"
      " _command_names() { print PROGRAMS; }; . \"" COMPLETION_FOLDER "/senseloom.zsh\"; words=(\"" TOOL_FILE "\" " +
      words + "); CURRENT=${#words}; _senseloom'");
}
std::string offeredByFish(const std::string& line) {
  return printedBy("HOME=/nowhere PATH=$(dirname '" TOOL_FILE
                   "'):$PATH fish --no-config -c 'source \"" COMPLETION_FOLDER
                   "/senseloom.fish\"; complete -C \"senseloom " +
                   line + "\"' 2>/dev/null");
}

TEST(Completion, OffersEverySensorOfTheTool) {
  std::string sensors;
  for (const std::string& name : sensorNames()) sensors += name + '\n';
  EXPECT_EQ(offeredByBash("sensors \"\""), sensors);
  EXPECT_EQ(offeredByBash("explain \"\""), sensors);
  EXPECT_EQ(offeredByBash("sweep --sensor \"\""), sensors);
}

TEST(Completion, OffersCommandsOptionsAndTheirValues) {
  EXPECT_EQ(offeredByBash("re"), "replay\nrecord\n");
  EXPECT_EQ(offeredByBash("generate \"\""), "commute\n");
  EXPECT_EQ(offeredByBash("generate commute --s"), "--seed\n");
  EXPECT_EQ(offeredByBash("replay --log \"\""), "debug\ninfo\nwarn\nerror\nnone\n");
  EXPECT_EQ(offeredByBash("convert --time-unit m"), "ms\n");
  EXPECT_EQ(offeredByBash("replay --plot \"\""), "\n") << "a file, which the shell itself completes";
}

TEST(Completion, OffersProgramsToRecordAndToWatch) {
  EXPECT_NE(("\n" + offeredByBash("watch -- bas")).find("\nbash\n"), std::string::npos);
  EXPECT_EQ(offeredByBash("watch \"\""), "\n") << "a file, which the shell itself completes";
  EXPECT_NE(("\n" + offeredByBash("record -o x.jsonl -- bas")).find("\nbash\n"), std::string::npos);
}

TEST(Completion, WorksInZsh) {
  EXPECT_EQ(offeredByZsh("sensors ST"), "STAP:tapping\n");
  EXPECT_EQ(offeredByZsh("replay --ch"), "--check:compare every result with the recorded one\n");
  EXPECT_EQ(offeredByZsh("replay \"\""), "FILES\n");
  EXPECT_EQ(offeredByZsh("record -- \"\""), "PROGRAMS\n");
  EXPECT_EQ(offeredByZsh("convert --output \"\""), "FILES -/\n");
}

TEST(Completion, WorksInFish) {
  EXPECT_EQ(offeredByFish("sensors ST"), "STAP\ttapping\n");
  EXPECT_EQ(offeredByFish("replay --ch"), "--check\tcompare every result with the recorded one\n");
  EXPECT_EQ(offeredByFish("replay --log e"), "error\n");
}

}  // namespace
}  // namespace senseloom::tool
