#include "trace/trace_reader.h"

#include <gtest/gtest.h>

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
    return TraceReader(file);
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
  auto call = reader.next();
  ASSERT_TRUE(call);
  EXPECT_EQ(call->line, 1U);
  EXPECT_EQ(call->kind, CallKind::open);
  EXPECT_EQ(call->session, "nav");
  EXPECT_EQ(call->sensor, findSensor("PHYAC"));

  call = reader.next();
  ASSERT_TRUE(call);
  EXPECT_EQ(call->line, 2U);
  EXPECT_EQ(call->kind, CallKind::setOption);
  EXPECT_EQ(call->session, "nav");
  EXPECT_EQ(call->option, R"({"logN":3,"mode":1})");

  call = reader.next();
  ASSERT_TRUE(call);
  EXPECT_EQ(call->kind, CallKind::dispatch);
  EXPECT_EQ(call->session, "nav");
  EXPECT_EQ(call->sensor, nullptr);
  EXPECT_EQ(compactText(call->record.get()), R"({"hex":"00"})");

  call = reader.next();
  ASSERT_TRUE(call);
  EXPECT_EQ(call->kind, CallKind::dispatch);
  EXPECT_EQ(call->session, "");
  EXPECT_EQ(call->sensor, findSensor("STAP"));

  call = reader.next();
  ASSERT_TRUE(call);
  EXPECT_EQ(call->kind, CallKind::close);
  EXPECT_EQ(call->session, "nav");

  call = reader.next();
  ASSERT_TRUE(call);
  EXPECT_EQ(call->line, 6U);
  EXPECT_EQ(call->kind, CallKind::uninit);

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

TEST_F(TraceReading, FindsNothingInAnEmptyFile) {
  EXPECT_FALSE(readerOf("").next());
}

TEST_F(TraceReading, IgnoresMembersThatACallDoesNotHave) {
  TraceReader reader = readerOf(R"({"call":"close","session":"nav","note":"home","return":0})");
  EXPECT_TRUE(reader.next());
}

TEST_F(TraceReading, PassesAnOptionGivenAsAStringOnAsItStands) {
  TraceReader reader = readerOf(R"({"call":"set_option","session":"a","option":" {\"mode\": 1,"})");
  EXPECT_EQ(reader.next()->option, R"( {"mode": 1,)");
}

TEST_F(TraceReading, TakesANullOptionForANullPointer) {
  TraceReader reader = readerOf(R"({"call":"set_option","session":"a","option":null})");
  const auto call = reader.next();
  ASSERT_TRUE(call);
  EXPECT_EQ(call->option, std::nullopt);
}

TEST_F(TraceReading, TakesAnOptionGivenAsBytes) {
  TraceReader reader = readerOf(R"({"call":"set_option","session":"a","optionHex":"7bff00"})");
  EXPECT_EQ(reader.next()->option, std::string("{\xff\0", 3));
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

TEST_F(TraceReading, GivesWhatWasRecordedOfACall) {
  TraceReader reader = readerOf(R"({"call":"close","session":"a","properties":[],"returned":1,"note":"x","result":{}}
{"call":"close","session":"a","returned":null}
{"call":"close","session":"a","properties":[]}
)");
  EXPECT_EQ(compactText(reader.next()->recorded.get()), R"({"returned":1,"properties":[],"result":{}})");
  EXPECT_EQ(compactText(reader.next()->recorded.get()), R"({"returned":null})");
  EXPECT_EQ(reader.next()->recorded, nullptr);
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

TEST_F(TraceReading, KnowsNoSizeOfWhatIsNoFile) {
  EXPECT_EQ(TraceReader("/dev/null").size(), 0U);
}

TEST_F(TraceReading, NamesFileAndLineAsItsPosition) {
  TraceReader reader = readerOf("\n{\"call\":\"uninit\"}\n");
  EXPECT_EQ(reader.position(), file);
  reader.next();
  EXPECT_EQ(reader.position(), file + ":2");
}

TEST_F(TraceReading, RefusesLinesThatAreNoCall) {
  const std::pair<const char*, const char*> lines[] = {
      {"[]", "not a JSON object"},
      {"{}", "missing \"call\""},
      {R"({"call":1})", "\"call\" must be a string"},
      {R"({"call":"opne"})", "unknown call \"opne\": open, set_option, dispatch, close and uninit are known"},
      {R"({"call":"open","sensor":"STAP"})", "missing \"session\""},
      {R"({"call":"open","session":7,"sensor":"STAP"})", "\"session\" must be a string"},
      {R"({"call":"open","session":"","sensor":"STAP"})", "\"session\" must not be empty"},
      {R"({"call":"open","session":"a"})", "missing \"sensor\""},
      {R"({"call":"open","session":"a","sensor":null})", "\"sensor\" must be a string"},
      {R"({"call":"open","session":"a","sensor":"stap"})",
       "unknown sensor \"stap\": `senseloom sensors` prints those that are known"},
      {R"({"call":"set_option","option":{}})", "missing \"session\""},
      {R"({"call":"set_option","session":"a"})", "missing \"option\""},
      {R"({"call":"set_option","session":"a","option":[]})", "\"option\" must be an object, a string or null"},
      {R"({"call":"set_option","session":"a","option":3})", "\"option\" must be an object, a string or null"},
      {R"({"call":"set_option","session":"a","optionHex":"7"})",
       "\"optionHex\" must hold hexadecimal digits, two a byte"},
      {R"({"call":"set_option","session":"a","optionHex":7})", "\"optionHex\" must be a string"},
      {R"({"call":"dispatch","record":{}})", "a dispatch needs either \"session\" or \"sensor\""},
      {R"({"call":"dispatch","session":"a","sensor":"STAP","record":{}})",
       "a dispatch needs either \"session\" or \"sensor\""},
      {R"({"call":"dispatch","session":1,"record":{}})", "\"session\" must be a string"},
      {R"({"call":"dispatch","sensor":"X","record":{}})",
       "unknown sensor \"X\": `senseloom sensors` prints those that are known"},
      {R"({"call":"dispatch","session":"a"})", "missing \"record\""},
      {R"({"call":"dispatch","session":"a","record":"00"})", "\"record\" must be an object"},
      {R"({"call":"close"})", "missing \"session\""},
      {R"({"call":"close","session":{}})", "\"session\" must be a string"},
  };
  for (const auto& [line, message] : lines) EXPECT_EQ(errorOf(line), message) << line;
}

TEST_F(TraceReading, RefusesLinesThatAreNoJson) {
  for (const std::string& line :
       {std::string("{"), std::string("call"), std::string("{} {}"), std::string(R"({"call":"open","call":"close"})"),
        std::string("{\"call\":\"\xff\"}"), std::string("\0{}", 3), std::string(R"({"call":99999999999999999999})")}) {
    EXPECT_EQ(errorOf(line).substr(0, 10), "not JSON: ") << line;
  }
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
