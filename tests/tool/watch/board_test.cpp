#include "watch/board.h"

#include <gtest/gtest.h>

#include "explain/explainer.h"
#include "explain/log_capture.h"
#include "parsed.h"
#include "trace/trace_call.h"

namespace senseloom::tool {
namespace {

// Makes the calls of a trace for a board.
class BoardTest : public testing::Test, private ReplayObserver {
 protected:
  void call(const std::string& text) {
    TraceCall call = readCall(parsed(text));
    call.line = ++lines;
    replayer.perform(call);
  }
  void open(const std::string& session, const std::string& sensor) {
    call(R"({"call":"open","session":")" + session + R"(","sensor":")" + sensor + "\"}");
  }
  void dispatch(const std::string& session, const std::string& record) {
    call(R"({"call":"dispatch","session":")" + session + R"(","record":)" + record + '}');
  }

  Board board;

 private:
  void onOutcome(const CallOutcome& outcome) override {
    explainer.onOutcome(outcome);
    board.onOutcome(outcome);
  }

  LogCapture log;
  Explainer explainer{board, log};
  Replayer replayer{*this};
  size_t lines = 0;
};

TEST_F(BoardTest, HasARowAClientInOpeningOrder) {
  open("b", "STAP");
  open("a", "PHYAC");
  call(R"({"call":"close","session":"b"})");
  open("b", "STAP");
  const auto rows = board.rows();
  ASSERT_EQ(rows.size(), 2U);
  EXPECT_EQ(rows[0].session + ' ' + rows[0].sensor, "b STAP");
  EXPECT_EQ(rows[1].session + ' ' + rows[1].sensor, "a PHYAC");
}

TEST_F(BoardTest, ShowsTheRequestThatIsInEffect) {
  open("a", "PHYAC");
  open("b", "PHYAC");
  EXPECT_EQ(board.rows()[0].request, "defaults");
  call(R"({"call":"set_option","session":"a","option":{"logN":3,"mode":1}})");
  EXPECT_EQ(board.rows()[0].request, "mode 1, logN 3");
  EXPECT_EQ(board.rows()[1].request, "defaults");
  call(R"({"call":"set_option","session":"a","option":"no JSON"})");
  EXPECT_EQ(board.rows()[0].request, "mode 1, logN 3") << "refused";
  call(R"({"call":"close","session":"a"})");
  EXPECT_EQ(board.rows()[0].request, "closed");
}

TEST_F(BoardTest, CountsAndShowsTheLastResult) {
  open("a", "LIFT");
  EXPECT_EQ(board.rows()[0].lastResult, "");
  dispatch("a", R"({"timestamp":1,"class":1})");
  dispatch("a", R"({"timestamp":2,"class":7})");
  const auto rows = board.rows();
  EXPECT_EQ(rows[0].records, 2U);
  EXPECT_EQ(rows[0].results, 2U);
  EXPECT_EQ(rows[0].lastResult, "class 7");
  EXPECT_EQ(rows[0].reason, "");
}

TEST_F(BoardTest, ShowsItemsAndTheMostFrequentReason) {
  open("a", "PHYAC");
  call(R"({"call":"set_option","session":"a","option":{"logN":2,"mode":1}})");
  for (const char* time : {"1", "2", "3", "4"}) {
    dispatch("a", std::string(R"({"timestamp":)") + time + R"(,"items":[{"class":3,"seq":5}]})");
  }
  EXPECT_EQ(board.rows()[0].results, 1U);
  EXPECT_EQ(board.rows()[0].lastResult, "class 3");
  EXPECT_EQ(board.rows()[0].reason, "batch filling 3");
}

TEST_F(BoardTest, MeasuresRatesOverASecondAndMore) {
  const auto start = Board::Clock::time_point();
  const auto dispatchSome = [this](int count) {
    for (int i = 0; i < count; ++i) dispatch("a", R"({"timestamp":1,"class":1})");
  };
  open("a", "LIFT");
  dispatchSome(9);
  board.measure(start);
  dispatchSome(3);
  board.measure(start + std::chrono::milliseconds(900));
  EXPECT_EQ(board.rows()[0].rate, 0);
  board.measure(start + std::chrono::seconds(2));
  EXPECT_EQ(board.rows()[0].rate, 1.5);
  board.measure(start + std::chrono::seconds(3));
  EXPECT_EQ(board.rows()[0].rate, 0);
}

}  // namespace
}  // namespace senseloom::tool
