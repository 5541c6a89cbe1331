#include "trace/trace_reader.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <fstream>
#include <string>
#include <utility>
#include <vector>

#include "input_error.h"

namespace senseloom::tool {
namespace {

class TraceReading : public testing::Test {
 protected:
  ~TraceReading() override { std::remove(file.c_str()); }

  TraceReader readerOf(const std::string& text) {
    std::ofstream(file, std::ios::binary) << text;
    return TraceReader(file, [this](const std::string& remark) { remarks += remark + '\n'; });
  }

  // What is remarked upon of a trace, without its name.
  std::string remarksOn(const std::string& text) {
    TraceReader reader = readerOf(text);
    while (reader.next()) {
    }
    return remarks.substr(std::min(file.size(), remarks.size()));
  }

  std::string errorOf(const std::string& line) {
    TraceReader reader = readerOf(line);
    try {
      reader.next();
      return "no error";
    } catch (const InputError& error) {
      return error.what();
    }
  }

  std::string remarks;
  // One a test, since tests run at the same time.
  const std::string file =
      testing::TempDir() + "trace_" + testing::UnitTest::GetInstance()->current_test_info()->name();
};

TEST_F(TraceReading, GivesTheCallsInOrderWithTheirLines) {
  TraceReader reader = readerOf(
      R"({"call":"open","session":"nav","sensor":"PHYAC"}
{"call":"set_option","session":"nav","option":{"logN":3, "mode":1}}
{"call":"dispatch","session":"nav","record":{"hex":"00"}}
{"call":"dispatch","sensor":"STAP","record":{"hex":"01"}}
{"call":"close","session":"nav"}
{"call":"uninit"}
)");
  for (const auto& [line, kind] : {std::pair{1U, CallKind::open},
                                   {2U, CallKind::setOption},
                                   {3U, CallKind::dispatch},
                                   {4U, CallKind::dispatch},
                                   {5U, CallKind::close},
                                   {6U, CallKind::uninit}}) {
    const auto call = reader.next();
    ASSERT_TRUE(call);
    EXPECT_EQ(call->line, line);
    EXPECT_EQ(call->kind, kind);
  }
  EXPECT_FALSE(reader.next());
  EXPECT_FALSE(reader.next());
}

TEST_F(TraceReading, SkipsBlankLinesAndCountsThem) {
  TraceReader reader = readerOf("\n \t\r\n{\"call\":\"uninit\"}\r\n\n");
  const auto call = reader.next();
  ASSERT_TRUE(call);
  EXPECT_EQ(call->line, 3U);
  EXPECT_FALSE(reader.next());
}

TEST_F(TraceReading, TakesALastLineWithoutItsEnd) {
  TraceReader reader = readerOf(R"({"call":"uninit"})");
  EXPECT_TRUE(reader.next());
  EXPECT_FALSE(reader.next());
}

TEST_F(TraceReading, FindsNothingInAnEmptyFileAndSaysSo) {
  EXPECT_EQ(remarksOn(""), ": the trace is empty: there is no call in it\n");
}

const std::string kRecordingHead = R"({"format":1,"tool":"1.0.0"})"
                                   "\n";
const std::string kRecordedCall = R"({"call":"uninit","atUs":3})"
                                  "\n";

TEST_F(TraceReading, PassesARecordingThatIsWhole) {
  EXPECT_EQ(remarksOn(kRecordingHead + kRecordedCall + kRecordedCall + R"({"end":2,"lost":0})" + "\n"), "");
  EXPECT_EQ(remarksOn(kRecordingHead + kRecordedCall + R"({"end":1,"lost":0})" + "\n" + kRecordedCall +
                      R"({"end":2,"lost":0})"),
            "");
}

TEST_F(TraceReading, RemarksOnARecordingWithoutItsEnd) {
  const std::string cut = ": the recording was cut short after 1 calls: its end is missing\n";
  EXPECT_EQ(remarksOn(kRecordingHead + kRecordedCall), cut);
  remarks.clear();
  EXPECT_EQ(remarksOn(kRecordingHead + kRecordedCall + kRecordedCall.substr(0, 20)), cut) << "in the middle of a line";
  remarks.clear();
  EXPECT_EQ(remarksOn(kRecordingHead + kRecordedCall + std::string(9000, '\0')), cut)
      << "before room that was not used";
  remarks.clear();
  EXPECT_EQ(remarksOn(kRecordingHead + kRecordedCall + R"({"end":1,"lost":0})" + "\n" + kRecordedCall),
            ": the recording was cut short after 2 calls: its end is missing\n");
}

TEST_F(TraceReading, RemarksOnWhatIsMissing) {
  EXPECT_EQ(remarksOn(kRecordingHead + kRecordedCall + R"({"end":2,"lost":3,"why":"no room","cause":"a signal"})"),
            ":3: the recording ended with 2 calls, but 1 are there\n" + file +
                ":3: 3 lines could not be recorded: no room\n" + file + ":3: a signal\n");
}

TEST_F(TraceReading, RemarksOnBreachesOfTheContract) {
  EXPECT_EQ(remarksOn(R"({"note":"two at once","breach":"two threads","threads":[1,2]})"
                      "\n" +
                      std::string(R"({"call":"uninit"})")),
            ":1: two at once\n");
}

TEST_F(TraceReading, RefusesAnotherFormatAnotherHeadAndNoHead) {
  EXPECT_EQ(errorOf(R"({"format":2})"), "a trace of format 2, where this program reads format 1");
  EXPECT_EQ(errorOf(kRecordingHead + kRecordingHead),
            "another recording, or another part of it, begins here: each is a trace of its own");
  EXPECT_EQ(errorOf(kRecordedCall), "this is in the middle of a recording, whose head is missing");
}

TEST_F(TraceReading, SkipsNotesOnLinesOfTheirOwn) {
  TraceReader reader = readerOf(R"({"note":"here we go","returned":-1}
{"call":"uninit","note":"a call all the same"}
{"note":null}
)");
  const auto call = reader.next();
  ASSERT_TRUE(call);
  EXPECT_EQ(call->line, 2U);
  EXPECT_FALSE(reader.next());
}

// It is not counted among the calls of a recording either.
TEST_F(TraceReading, PassesReleasesOnAsideFromTheCalls) {
  TraceReader reader = readerOf(kRecordingHead + kRecordedCall + R"({"call":"release","list":4,"atUs":5,"thread":1})" +
                                "\n" + R"({"end":1,"lost":0})" + "\n");
  std::vector<size_t> releases;
  reader.listen([&](size_t line, const Json& aside) {
    if (isRelease(aside)) releases.push_back(line);
  });
  EXPECT_TRUE(reader.next());
  EXPECT_FALSE(reader.next());
  EXPECT_EQ(releases, (std::vector<size_t>{3}));
  EXPECT_EQ(remarks, "");
}

TEST_F(TraceReading, RefusesAReleaseThatNamesNoList) {
  EXPECT_EQ(errorOf(R"({"call":"release"})"), "missing \"list\"");
  EXPECT_EQ(errorOf(R"({"call":"release","list":"x"})"), "\"list\" must be the number of a list, null or \"unknown\"");
}

TEST_F(TraceReading, CountsTheBytesOfTheLinesReadAndOfTheFile) {
  TraceReader reader = readerOf("\n{\"call\":\"uninit\"}\n{\"call\":\"uninit\"}");
  EXPECT_EQ(reader.size(), 36U);
  EXPECT_EQ(reader.bytesRead(), 0U);
  reader.next();
  EXPECT_EQ(reader.bytesRead(), 19U);
  reader.next();
  EXPECT_EQ(reader.bytesRead(), 36U);
}

TEST_F(TraceReading, HasNoSizeOfWhatIsNotAFile) {
  EXPECT_EQ(TraceReader("/dev/null").size(), 0U);
}

TEST_F(TraceReading, NamesFileAndLineAsItsPosition) {
  TraceReader reader = readerOf("\n{\"call\":\"uninit\"}\n");
  EXPECT_EQ(reader.position(), file);
  reader.next();
  EXPECT_EQ(reader.position(), file + ":2");
}

TEST_F(TraceReading, RefusesLinesThatAreNotACall) {
  EXPECT_EQ(errorOf("[]"), "not a JSON object");
  EXPECT_EQ(errorOf("{}"), "missing \"call\"");
}

TEST_F(TraceReading, RefusesLinesThatAreNotJson) {
  for (const std::string& line :
       {std::string("{"), std::string("call"), std::string("{} {}"), std::string(R"({"call":"open","call":"close"})"),
        std::string("{\"call\":\"\xff\"}"), std::string("\0{}", 3), std::string(R"({"call":99999999999999999999})")}) {
    EXPECT_EQ(errorOf(line).substr(0, 10), "not JSON: ") << line;
  }
}

TEST_F(TraceReading, TakesAByteOrderMarkInFront) {
  TraceReader reader = readerOf("\xEF\xBB\xBF{\"call\":\"uninit\"}\n{\"call\":\"uninit\"}\n");
  EXPECT_TRUE(reader.next());
  EXPECT_TRUE(reader.next());
  EXPECT_EQ(errorOf("\n\xEF\xBB\xBF{\"call\":\"uninit\"}").substr(0, 10), "not JSON: ");
}

TEST_F(TraceReading, GoesOnAfterALongLine) {
  const std::string note(3'000'000, 'x');
  TraceReader reader = readerOf(R"({"call":"uninit","note":")" + note + "\"}\n{\"call\":\"uninit\"}\n");
  EXPECT_TRUE(reader.next());
  EXPECT_EQ(reader.next()->line, 2U);
}

TEST_F(TraceReading, ReportsAFileThatCannotBeOpened) {
  try {
    TraceReader reader(testing::TempDir() + "no/such/file");
    FAIL() << "opened";
  } catch (const InputError& error) {
    EXPECT_EQ(error.what(), testing::TempDir() + "no/such/file: No such file or directory");
  }
}

}  // namespace
}  // namespace senseloom::tool
