#include "watch/board_view.h"

#include <gtest/gtest.h>

#include "watch/screen_text.h"

namespace senseloom::tool {
namespace {

const std::vector<BoardRow> kRows{
    {.session = "nav",
     .sensor = "PHYAC",
     .request = "logN 3",
     .records = 90,
     .results = 11,
     .rate = 9.96,
     .lastResult = "class 3 seq 5",
     .reason = "batch filling 79"},
    {.session = "Größe",
     .sensor = "LIFT",
     .request = "defaults",
     .records = 7,
     .results = 7,
     .rate = 0.5,
     .lastResult = "class 1",
     .reason = ""},
    {.session = "lock",
     .sensor = "STAP",
     .request = "closed",
     .records = 800,
     .results = 0,
     .rate = 0,
     .lastResult = "",
     .reason = "class not wanted 800"},
};

using Lines = std::vector<std::string>;

constexpr char kKeys[] = "s sort  r reverse  / filter  p pause  up/down move  q quit";

// The sessions of the rows on a screen, from the top.
std::string sessionsOf(BoardView& view, size_t height = 24) {
  const Lines lines = screenLines("t", kRows, view, {.width = 80, .height = height});
  std::string sessions;
  for (size_t i = 2; i + 1 < lines.size(); ++i) sessions += lines[i].substr(0, lines[i].find(' ')) + ' ';
  return sessions.substr(0, sessions.find_last_not_of(' ') + 1);
}

BoardView after(std::string_view keys) {
  BoardView view;
  EXPECT_EQ(pressKeys(keys, view), Leaving::no);
  return view;
}

std::string sessionsAfter(std::string_view keys) {
  BoardView view = after(keys);
  return sessionsOf(view);
}

TEST(BoardView, FillsTheScreenWithTitleHeadingsRowsAndKeys) {
  BoardView view;
  EXPECT_EQ(screenLines("run.jsonl", kRows, view, {.width = 100, .height = 7}),
            (Lines{
                "run.jsonl: 3 sessions",
                "session  sensor  request   records  results  rate/s  last           reason",
                "nav      PHYAC   logN 3         90       11    10.0  class 3 seq 5  batch filling 79",
                "Größe    LIFT    defaults        7        7     0.5  class 1",
                "lock     STAP    closed        800        0     0.0                 class not wanted 800",
                "",
                kKeys,
            }));
}

TEST(BoardView, ShortensTextsSoThatNothingWrapsIn80Columns) {
  BoardView view;
  const Lines lines = screenLines("run.jsonl", kRows, view, {.width = 80, .height = 7});
  EXPECT_EQ(lines[1], "session  sensor  request   records  results  rate/s  last          reason");
  EXPECT_EQ(lines[4], "lock     STAP    closed        800        0     0.0                class not wa…");
}

TEST(BoardView, IsNeverWiderThanTheScreenNorHigher) {
  for (size_t width = 1; width < 120; ++width) {
    for (const size_t height : {1U, 2U, 3U, 4U, 24U}) {
      BoardView view;
      const Lines lines = screenLines("a long title", kRows, view, {.width = width, .height = height});
      EXPECT_EQ(lines.size(), height);
      for (const std::string& line : lines) EXPECT_LE(widthOf(line), width) << line;
    }
  }
}

TEST(BoardView, CannotBeMadeToControlTheTerminal) {
  BoardRow row = kRows[0];
  row.session = "\x1b]0;x\a";
  BoardView view;
  const Lines lines = screenLines("\x1b[2J", {row}, view, {});
  for (const std::string& line : lines) EXPECT_EQ(line.find_first_of("\x1b\a"), std::string::npos) << line;
}

TEST(BoardView, IsSortedByTheNextColumnWithEachKey) {
  EXPECT_EQ(sessionsAfter(""), "nav Größe lock") << "in opening order";
  EXPECT_EQ(sessionsAfter("s"), "Größe lock nav");
  EXPECT_EQ(sessionsAfter("ss"), "Größe nav lock") << "by sensor";
  EXPECT_EQ(sessionsAfter("ssss"), "lock nav Größe") << "by records, the most first";
  EXPECT_EQ(sessionsAfter("ssssr"), "Größe nav lock");
  EXPECT_EQ(sessionsAfter("sssssssss"), "nav Größe lock") << "in opening order again";
}

TEST(BoardView, TellsByWhichColumnItIsSorted) {
  BoardView view = after("s");
  EXPECT_EQ(screenLines("t", kRows, view, {})[1].substr(0, 17), "session v  sensor");
  view.isReversed = true;
  EXPECT_EQ(screenLines("t", kRows, view, {})[1].substr(0, 17), "session ^  sensor");
}

TEST(BoardView, ShowsTheRowsThatHaveTheTextOfTheFilter) {
  EXPECT_EQ(sessionsAfter("/phy"), "nav");
  EXPECT_EQ(sessionsAfter("/NOT WANTED\r"), "lock");
  EXPECT_EQ(sessionsAfter("/größe\r"), "Größe") << "letters beyond ASCII as they are";
  EXPECT_EQ(sessionsAfter("/xyz\r"), "");
  EXPECT_EQ(sessionsAfter("/xyz\x1b"), "nav Größe lock");
  EXPECT_EQ(sessionsAfter("/phy\r\x1b"), "nav Größe lock");
}

TEST(BoardView, ShowsTheFilterWhileItIsTypedAndAfterwards) {
  BoardView view = after(
      "/n\xC3\xA9\x7fq\x7f"
      "av");
  EXPECT_EQ(view.filter, "nav");
  EXPECT_EQ(screenLines("t", kRows, view, {}).back(), "filter: nav_  (Enter keeps it, Esc removes it)");
  pressKeys("\r", view);
  const Lines lines = screenLines("t", kRows, view, {});
  EXPECT_EQ(lines.front(), "t: 3 sessions, 1 with \"nav\"");
  EXPECT_EQ(lines.back(), kKeys);
}

TEST(BoardView, SaysThatItIsPaused) {
  BoardView view = after("p");
  EXPECT_EQ(screenLines("t", kRows, view, {}).front(), "t: 3 sessions, paused");
  EXPECT_EQ(after("pp"), BoardView());
  EXPECT_EQ(after("  "), BoardView());
}

TEST(BoardView, MovesByArrowsAsFarAsThereAreRows) {
  BoardView view = after("\x1b[B");
  EXPECT_EQ(sessionsOf(view, 5), "Größe lock");
  pressKeys("\x1bOB\x1b[B\x1b[B", view);
  EXPECT_EQ(sessionsOf(view, 5), "Größe lock") << "the last row is at the bottom";
  pressKeys("\x1b[A", view);
  EXPECT_EQ(sessionsOf(view, 5), "nav Größe");
  pressKeys("\x1b[A\x1b[C\x1b[D", view);
  EXPECT_EQ(sessionsOf(view, 5), "nav Größe");
}

TEST(BoardView, IsLeftByTheKeysForThat) {
  BoardView view;
  EXPECT_EQ(pressKeys("sq", view), Leaving::byQuitting);
  EXPECT_EQ(view.sortedBy, 1U);
  EXPECT_EQ(pressKeys("\x03", view), Leaving::byInterrupt);
  EXPECT_EQ(pressKeys("\x1c", view), Leaving::byInterrupt);
  EXPECT_EQ(pressKeys("/q", view), Leaving::no) << "a letter of the filter";
  EXPECT_EQ(pressKeys("\x03", view), Leaving::byInterrupt);
}

}  // namespace
}  // namespace senseloom::tool
