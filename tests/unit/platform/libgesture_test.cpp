#include <gesture.h>
#include <gesture_answers.h>
#include <gtest/gtest.h>

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <fstream>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "gesture/drawings.h"
#include "support.h"

namespace {

constexpr std::int16_t kGroup[6] = {1, -2, 3, -4, 5, -6};

using Name = std::optional<std::string>;
constexpr std::nullopt_t kNone = std::nullopt;

class GestureEngine : public ::testing::Test {
 protected:
  ~GestureEngine() override {
    gesture_close();
    std::remove(scriptFile.c_str());
  }

  void writeScript(const std::string& text) { std::ofstream(scriptFile) << text; }

  static Name feed(bool last) {
    // The caller's way of releasing a name; the leak check sees one that is not.
    const std::unique_ptr<char[]> name(gesture_process_single_data(kGroup, 1, last));
    return name ? Name(name.get()) : kNone;
  }

  // The name at the last group; there is none before.
  static Name feedDrawing(const Record& record) {
    Name name;
    for (std::size_t i = 0; i < record.size(); ++i) {
      EXPECT_EQ(name, kNone);
      const std::unique_ptr<char[]> found(gesture_process_single_data(record[i].data(), 1, i + 1 == record.size()));
      if (found) name = found.get();
    }
    return name;
  }

  // The names of so many records of one group.
  static std::vector<Name> feedRecords(int count) {
    std::vector<Name> names;
    for (int i = 0; i < count; ++i) names.push_back(feed(true));
    return names;
  }

  // One a test, since tests run at the same time.
  const std::string scriptFile =
      ::testing::TempDir() + "gesture_" + ::testing::UnitTest::GetInstance()->current_test_info()->name();

 private:
  const ScopedVariable script{"SENSELOOM_GESTURE_SCRIPT", scriptFile.c_str()};
};

TEST_F(GestureEngine, ReturnsTheNamesOfTheScriptRecordByRecord) {
  writeScript("LetterA \nNumberZero \nLetterF \n");
  ASSERT_TRUE(gesture_initial(0, 0));
  EXPECT_EQ(feedRecords(3), (std::vector<Name>{"LetterA ", "NumberZero ", "LetterF "}));
}

TEST_F(GestureEngine, RecognisesAtTheLastGroupOfARecordAlone) {
  writeScript("LetterA \nLetterB \n");
  ASSERT_TRUE(gesture_initial(0, 0));
  EXPECT_EQ(feed(false), kNone);
  EXPECT_EQ(feed(false), kNone);
  EXPECT_EQ(feed(true), "LetterA ");
  EXPECT_EQ(feed(false), kNone);
  EXPECT_EQ(feed(true), "LetterB ");
}

TEST_F(GestureEngine, TakesALineToTheLetter) {
  writeScript("LetterA\nLetterA \n LetterA\n# LetterA \n \nLetterA \r\n");
  ASSERT_TRUE(gesture_initial(0, 0));
  EXPECT_EQ(feedRecords(6), (std::vector<Name>{"LetterA", "LetterA ", " LetterA", "# LetterA ", " ", "LetterA \r"}));
}

TEST_F(GestureEngine, RecognisesNothingAtAnEmptyLine) {
  writeScript("\nLetterA \n\n\nLetterB \n");
  ASSERT_TRUE(gesture_initial(0, 0));
  EXPECT_EQ(feedRecords(5), (std::vector<Name>{kNone, "LetterA ", kNone, kNone, "LetterB "}));
}

TEST_F(GestureEngine, RecognisesNothingPastTheEndOfTheScript) {
  writeScript("LetterA \n");
  ASSERT_TRUE(gesture_initial(0, 0));
  EXPECT_EQ(feedRecords(4), (std::vector<Name>{"LetterA ", kNone, kNone, kNone}));
}

TEST_F(GestureEngine, TakesALastLineWithoutAnEnd) {
  writeScript("LetterA \nLetterB ");
  ASSERT_TRUE(gesture_initial(0, 0));
  EXPECT_EQ(feedRecords(3), (std::vector<Name>{"LetterA ", "LetterB ", kNone}));
}

TEST_F(GestureEngine, StartsWithAnEmptyScript) {
  writeScript("");
  EXPECT_TRUE(gesture_initial(0, 0));
  EXPECT_EQ(feed(true), kNone);
}

TEST_F(GestureEngine, ReadsTheScriptFromTheStartAtEachStart) {
  writeScript("LetterA \nLetterB \n");
  ASSERT_TRUE(gesture_initial(0, 0));
  EXPECT_EQ(feed(true), "LetterA ");
  ASSERT_TRUE(gesture_initial(0, 0));
  EXPECT_EQ(feed(true), "LetterA ");
  gesture_close();
  writeScript("NumberOne \n");
  ASSERT_TRUE(gesture_initial(0, 0));
  EXPECT_EQ(feedRecords(2), (std::vector<Name>{"NumberOne ", kNone}));
}

TEST_F(GestureEngine, NamesOutliveTheEngine) {
  writeScript("LetterA \n");
  ASSERT_TRUE(gesture_initial(0, 0));
  const std::unique_ptr<char[]> name(gesture_process_single_data(kGroup, 1, true));
  gesture_close();
  EXPECT_STREQ(name.get(), "LetterA ");
}

TEST_F(GestureEngine, RecognisesNothingBeforeItsStartAndAfterItsClose) {
  writeScript("LetterA \nLetterB \n");
  EXPECT_EQ(feed(true), kNone);
  ASSERT_TRUE(gesture_initial(0, 0));
  gesture_close();
  EXPECT_EQ(feed(true), kNone);
  gesture_close();
}

TEST_F(GestureEngine, AnswersWhatItIsToldStartedOrNot) {
  const char* const names[] = {"LetterA ", nullptr, "LetterB "};
  gesture_answer_with(names, 3);
  EXPECT_EQ(feedRecords(4), (std::vector<Name>{"LetterA ", kNone, "LetterB ", kNone}));
  gesture_answer_with(names, 1);
  EXPECT_EQ(feedRecords(2), (std::vector<Name>{"LetterA ", kNone}));
  gesture_answer_with(nullptr, 0);
  EXPECT_EQ(feed(true), kNone);
}

TEST_F(GestureEngine, GoesOnWithTheScriptAfterItWasToldWhatToAnswer) {
  writeScript("NumberOne \nNumberTwo \n");
  ASSERT_TRUE(gesture_initial(0, 0));
  EXPECT_EQ(feed(true), "NumberOne ");
  const char* const name = "LetterA ";
  gesture_answer_with(&name, 1);
  EXPECT_EQ(feed(false), "LetterA ");
  EXPECT_EQ(feed(true), kNone);
  gesture_answer_with(nullptr, 0);
  EXPECT_EQ(feed(true), "NumberTwo ");
}

TEST_F(GestureEngine, DoesNotStartWithoutTheFileOfTheScript) {
  EXPECT_FALSE(gesture_initial(0, 0));
  EXPECT_EQ(feed(true), kNone);
}

TEST_F(GestureEngine, DoesNotStartWithAScriptThatCannotBeRead) {
  const ScopedVariable directory("SENSELOOM_GESTURE_SCRIPT", ::testing::TempDir().c_str());
  EXPECT_FALSE(gesture_initial(0, 0));
  EXPECT_EQ(feed(true), kNone);
}

TEST_F(GestureEngine, ForgetsItsScriptWhenItDoesNotStartAgain) {
  writeScript("LetterA \nLetterB \n");
  ASSERT_TRUE(gesture_initial(0, 0));
  std::remove(scriptFile.c_str());
  EXPECT_FALSE(gesture_initial(0, 0));
  EXPECT_EQ(feed(true), kNone);
}

TEST_F(GestureEngine, RecognisesDigitsWithoutAScript) {
  const auto drawings = drawingsOf(7);
  for (const char* const none : {static_cast<const char*>(nullptr), ""}) {
    const ScopedVariable unset("SENSELOOM_GESTURE_SCRIPT", none);
    ASSERT_TRUE(gesture_initial(0, 0));
    EXPECT_EQ(feedDrawing(drawings[0]), "NumberSeven ");
    EXPECT_EQ(feed(true), kNone);  // a record of one group
    EXPECT_EQ(feedDrawing(drawings[1]), "NumberSeven ");
  }
}

TEST_F(GestureEngine, ForgetsTheBeginningOfARecordWhenItStartsAgain) {
  const auto drawings = drawingsOf(4);
  const ScopedVariable unset("SENSELOOM_GESTURE_SCRIPT", nullptr);
  ASSERT_TRUE(gesture_initial(0, 0));
  for (int i = 0; i < 100; ++i) EXPECT_EQ(feed(false), kNone);
  ASSERT_TRUE(gesture_initial(0, 0));
  EXPECT_EQ(feedDrawing(drawings[0]), "NumberFour ");
}

TEST_F(GestureEngine, RecognisesNoDigitBeforeItsStartAndAfterItsClose) {
  const auto drawings = drawingsOf(4);
  const ScopedVariable unset("SENSELOOM_GESTURE_SCRIPT", nullptr);
  EXPECT_EQ(feedDrawing(drawings[0]), kNone);
  ASSERT_TRUE(gesture_initial(0, 0));
  gesture_close();
  EXPECT_EQ(feedDrawing(drawings[0]), kNone);
}

}  // namespace
