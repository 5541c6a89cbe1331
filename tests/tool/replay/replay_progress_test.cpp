#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>
#include <fstream>
#include <string>
#include <vector>

#include "recording.h"

namespace senseloom::tool {
namespace {

constexpr char kBegun[] = "[                    ]   0%\r";
const std::string kErased = std::string(27, ' ') + '\r';
constexpr char kSummary[] =
    "session  sensor    opened   records   results    failed\r\n"
    "a        LIFT           1         0         0         0\r\n";

// Runs the tool on a terminal of its own, and returns what is written to that. Standard output is the terminal, too, or
// goes to no one.
std::string runOnTerminal(std::vector<std::string> arguments, bool withOutput) {
  const int terminal = posix_openpt(O_RDWR | O_NOCTTY);
  EXPECT_EQ(grantpt(terminal), 0);
  EXPECT_EQ(unlockpt(terminal), 0);
  const int tool = open(ptsname(terminal), O_RDWR | O_NOCTTY);
  std::vector<char*> argv{const_cast<char*>("senseloom")};
  for (std::string& argument : arguments) argv.push_back(argument.data());
  argv.push_back(nullptr);

  const pid_t child = fork();
  if (child == 0) {
    const int out = withOutput ? tool : open("/dev/null", O_WRONLY);
    if (dup2(out, STDOUT_FILENO) < 0 || dup2(tool, STDERR_FILENO) < 0) _exit(126);
    execv(TOOL_FILE, argv.data());
    _exit(127);
  }
  close(tool);
  std::string text;
  char buffer[4096];
  for (ssize_t count; (count = read(terminal, buffer, sizeof buffer)) > 0;) {
    text.append(buffer, static_cast<size_t>(count));
  }
  close(terminal);
  int status = 0;
  waitpid(child, &status, 0);
  EXPECT_EQ(status, 0);
  return text;
}

// A trace of a few calls, and of so many blanks.
void writeTrace(const std::string& file, size_t blanks) {
  std::ofstream(file) << R"({"call":"open","session":"a","sensor":"LIFT"})" << '\n'
                      << std::string(blanks, ' ') << '\n'
                      << R"({"call":"close","session":"a","returned":0})" << '\n';
}

class ReplayProgressTest : public testing::Test {
 protected:
  ReplayProgressTest() { writeTrace(longTrace.name, 1 << 20); }
  const ScratchFile longTrace{"long"};
};

TEST_F(ReplayProgressTest, IsShownWhenOutputGoesElsewhere) {
  const std::string text = runOnTerminal({"replay", longTrace.name}, false);
  EXPECT_EQ(text.rfind(kBegun, 0), 0U) << text;
  EXPECT_EQ(text.substr(text.size() - kErased.size()), kErased);
  EXPECT_EQ(text.find('\n'), std::string::npos);
}

TEST_F(ReplayProgressTest, IsGoneBeforeASummary) {
  const std::string text = runOnTerminal({"replay", "--quiet", longTrace.name}, true);
  EXPECT_EQ(text.rfind(kBegun, 0), 0U) << text;
  const std::string end = kErased + kSummary;
  ASSERT_GE(text.size(), end.size());
  EXPECT_EQ(text.substr(text.size() - end.size()), end);
}

TEST_F(ReplayProgressTest, IsShownWhenComparing) {
  const std::string text = runOnTerminal({"replay", "--check", longTrace.name}, true);
  EXPECT_EQ(text.rfind(kBegun, 0), 0U) << text;
  const std::string end = kErased + "1 calls compared, all as recorded; 1 without a recorded result\r\n";
  ASSERT_GE(text.size(), end.size());
  EXPECT_EQ(text.substr(text.size() - end.size()), end);
}

TEST_F(ReplayProgressTest, IsNotShownWhereTheOutputIs) {
  EXPECT_EQ(runOnTerminal({"replay", longTrace.name}, true),
            "  line  call        session   sensor  return  outcome\r\n"
            "     1  open        a         LIFT    handle\r\n"
            "     3  close       a         LIFT    0\r\n");
}

TEST_F(ReplayProgressTest, IsNotShownWithoutATerminal) {
  EXPECT_EQ(runTool({"replay", "--quiet", longTrace.name}).err, "");
}

TEST_F(ReplayProgressTest, IsNotShownForAShortTrace) {
  const ScratchFile shortTrace("short");
  writeTrace(shortTrace.name, (1 << 20) - 200);
  EXPECT_EQ(runOnTerminal({"replay", "--quiet", shortTrace.name}, true), kSummary);
}

}  // namespace
}  // namespace senseloom::tool
