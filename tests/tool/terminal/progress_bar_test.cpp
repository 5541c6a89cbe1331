#include "terminal/progress_bar.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <string>

namespace senseloom::tool {
namespace {

using namespace std::chrono_literals;

ProgressBar::Clock::time_point now;
ProgressBar::Clock::time_point fakeClock() {
  return now;
}

const std::string kErased(27, ' ');

// What is on the terminal so far.
class ProgressBarTest : public testing::Test {
 protected:
  ProgressBarTest() : terminal(open_memstream(&text, &size)) {}
  ~ProgressBarTest() override {
    std::fclose(terminal);
    std::free(text);
  }
  std::string shown() {
    std::fflush(terminal);
    return {text, size};
  }

  char* text = nullptr;
  size_t size = 0;
  std::FILE* terminal;
};

TEST_F(ProgressBarTest, IsDrawnAtOnceAndAtMostTenTimesASecond) {
  ProgressBar bar(terminal, 200, fakeClock);
  bar.show(0);
  const std::string none = "[                    ]   0%\r";
  EXPECT_EQ(shown(), none);
  now += 99ms;
  bar.show(20);
  EXPECT_EQ(shown(), none);
  now += 1ms;
  bar.show(99);
  EXPECT_EQ(shown(), none + "[=========           ]  49%\r");
}

TEST_F(ProgressBarTest, IsFullAtTheWholeAndBeyond) {
  const std::string full = "[====================] 100%\r";
  ProgressBar bar(terminal, 200, fakeClock);
  bar.show(200);
  EXPECT_EQ(shown(), full);
  now += 1s;
  bar.show(300);  // the file grew
  EXPECT_EQ(shown(), full + full);
}

TEST_F(ProgressBarTest, IsErasedAtItsEnd) {
  { ProgressBar(terminal, 200, fakeClock).show(100); }
  EXPECT_EQ(shown(), "[==========          ]  50%\r" + kErased + '\r');
}

TEST_F(ProgressBarTest, LeavesNoTraceWhenItWasNotDrawn) {
  { ProgressBar bar(terminal, 200, fakeClock); }
  EXPECT_EQ(shown(), "");
}

}  // namespace
}  // namespace senseloom::tool
