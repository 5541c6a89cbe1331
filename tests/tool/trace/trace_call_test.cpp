#include "trace/trace_call.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>

#include "input_error.h"
#include "parsed.h"

namespace senseloom::tool {
namespace {

TraceCall callOf(const std::string& line) {
  return readCall(parsed(line));
}

std::string errorOf(const std::string& line) {
  try {
    callOf(line);
    return "no error";
  } catch (const InputError& error) {
    return error.what();
  }
}

TEST(TraceCall, OpensASessionOnASensor) {
  const TraceCall call = callOf(R"({"call":"open","session":"nav","sensor":"PHYAC"})");
  EXPECT_EQ(call.kind, CallKind::open);
  EXPECT_EQ(call.session, "nav");
  EXPECT_EQ(call.sensor, findSensor("PHYAC"));
}

TEST(TraceCall, DispatchesARecordToASession) {
  const TraceCall call = callOf(R"({"call":"dispatch","session":"nav","record":{"hex":"00"}})");
  EXPECT_EQ(call.kind, CallKind::dispatch);
  EXPECT_EQ(call.session, "nav");
  EXPECT_EQ(call.sensor, nullptr);
  EXPECT_EQ(compactText(call.record.get()), R"({"hex":"00"})");
}

TEST(TraceCall, DispatchesARecordToASensor) {
  const TraceCall call = callOf(R"({"call":"dispatch","sensor":"STAP","record":{"hex":"01"}})");
  EXPECT_EQ(call.session, "");
  EXPECT_EQ(call.sensor, findSensor("STAP"));
}

std::string dispatchWithEngine(const std::string& engine) {
  return R"({"call":"dispatch","session":"a","record":{"hex":""},"engine":)" + engine + '}';
}

TEST(TraceCall, KnowsWhatTheGestureEngineAnswered) {
  EXPECT_FALSE(callOf(R"({"call":"dispatch","session":"a","record":{"hex":""}})").engine);
  const auto none = callOf(dispatchWithEngine("[]")).engine;
  ASSERT_TRUE(none);
  EXPECT_TRUE(none->empty());

  const auto engine =
      callOf(dispatchWithEngine(R"([{"group":0,"name":"LetterA "},{"group":169,"nameHex":"ff"}])")).engine;
  ASSERT_TRUE(engine);
  ASSERT_EQ(engine->size(), 2U);
  EXPECT_EQ(engine->front().group, 0);
  EXPECT_EQ(engine->front().name, "LetterA ");
  EXPECT_EQ(engine->back().group, 169);
  EXPECT_EQ(engine->back().name, "\xff");
}

TEST(TraceCall, RefusesAnswersThatNoGestureEngineGives) {
  const auto engineErrorOf = [](const std::string& engine) { return errorOf(dispatchWithEngine(engine)); };
  EXPECT_EQ(engineErrorOf("null"), "\"engine\" must be an array");
  EXPECT_EQ(engineErrorOf("[7]"), "\"engine\" must hold objects");
  EXPECT_EQ(engineErrorOf(R"([{"name":"LetterA "}])"), "missing \"group\"");
  for (const char* group : {"-1", "170", "\"0\"", "1.0"}) {
    EXPECT_EQ(engineErrorOf(std::string(R"([{"name":"LetterA ","group":)") + group + "}]"),
              "\"group\" must be 0 to 169");
  }
  EXPECT_EQ(engineErrorOf(R"([{"group":0}])"), "missing \"name\"");
  EXPECT_EQ(engineErrorOf(R"([{"group":0,"name":3}])"), "\"name\" must be a string");
  EXPECT_EQ(engineErrorOf(R"([{"group":0,"nameHex":"0"}])"), "\"nameHex\" must hold hexadecimal digits, two a byte");
}

TEST(TraceCall, ClosesASessionWhateverElseItsLineHolds) {
  const TraceCall call = callOf(R"({"call":"close","session":"nav","note":"home","return":0})");
  EXPECT_EQ(call.kind, CallKind::close);
  EXPECT_EQ(call.session, "nav");
  EXPECT_EQ(call.recorded, nullptr);
}

TEST(TraceCall, PassesAnOptionGivenAsAStringOnAsItStands) {
  EXPECT_EQ(callOf(R"({"call":"set_option","session":"a","option":" {\"mode\": 1,"})").option, R"( {"mode": 1,)");
}

TEST(TraceCall, WritesAnOptionGivenAsAnObjectWithoutBlanks) {
  const TraceCall call = callOf(R"({"call":"set_option","session":"nav","option":{"logN":3, "mode":1}})");
  EXPECT_EQ(call.kind, CallKind::setOption);
  EXPECT_EQ(call.session, "nav");
  EXPECT_EQ(call.option, R"({"logN":3,"mode":1})");
}

TEST(TraceCall, TakesANullOptionForANullPointer) {
  EXPECT_EQ(callOf(R"({"call":"set_option","session":"a","option":null})").option, std::nullopt);
}

TEST(TraceCall, TakesAnOptionGivenAsBytes) {
  EXPECT_EQ(callOf(R"({"call":"set_option","session":"a","optionHex":"7bff00"})").option, std::string("{\xff\0", 3));
}

TEST(TraceCall, HasItsRecordedOutcome) {
  const auto recorded = [](const std::string& members) {
    const TraceCall call = callOf(R"({"call":"close","session":"a")" + members + "}");
    return call.recorded == nullptr ? "nothing" : compactText(call.recorded.get());
  };
  EXPECT_EQ(recorded(R"(,"properties":[],"returned":1,"note":"x","result":{})"),
            R"({"returned":1,"properties":[],"result":{}})");
  EXPECT_EQ(recorded(R"(,"returned":null)"), R"({"returned":null})");
  EXPECT_EQ(recorded(R"(,"properties":[])"), "nothing");
}

TEST(TraceCall, HasTheNumberOfTheListThatItGave) {
  EXPECT_EQ(callOf(R"({"call":"close","session":"a","list":7})").list, 7);
  EXPECT_EQ(callOf(R"({"call":"close","session":"a"})").list, 0);
}

TEST(TraceCall, KnowsWhichListIsReleased) {
  const auto released = [](const std::string& list) {
    const Json release = parsed(R"({"call":"release","list":)" + list + "}");
    EXPECT_TRUE(isRelease(release));
    return releasedList(release);
  };
  EXPECT_EQ(released("7"), 7);
  EXPECT_EQ(released("\"unknown\""), 0);
  EXPECT_EQ(released("null"), std::nullopt);
  for (const char* wrong : {"0", "-1", "1.5", "\"\"", "[]"}) EXPECT_THROW(released(wrong), InputError) << wrong;
  EXPECT_FALSE(isRelease(parsed(R"({"call":"close","list":7})")));
}

TEST(TraceCall, RefusesMissingAndMistypedMembers) {
  const std::pair<const char*, const char*> lines[] = {
      {R"({"call":1})", "\"call\" must be a string"},
      {R"({"call":"opne"})", "unknown call \"opne\": open, set_option, dispatch, close, uninit and release are known"},
      {R"({"call":"open","sensor":"STAP"})", "missing \"session\""},
      {R"({"call":"open","session":7,"sensor":"STAP"})", "\"session\" must be a string"},
      {R"({"call":"open","session":"","sensor":"STAP"})", "\"session\" must not be empty"},
      {R"({"call":"open","session":"a"})", "missing \"sensor\""},
      {R"({"call":"open","session":"a","sensor":null})", "\"sensor\" must be a string"},
      {R"({"call":"open","session":"a","sensor":"stap"})",
       "unknown sensor \"stap\": the nearest is \"STAP\"; `senseloom sensors` prints all"},
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
       "unknown sensor \"X\": the nearest is \"GSPX\"; `senseloom sensors` prints all"},
      {R"({"call":"dispatch","session":"a"})", "missing \"record\""},
      {R"({"call":"dispatch","session":"a","record":"00"})", "\"record\" must be an object"},
      {R"({"call":"close"})", "missing \"session\""},
      {R"({"call":"close","session":{}})", "\"session\" must be a string"},
  };
  for (const auto& [line, message] : lines) EXPECT_EQ(errorOf(line), message) << line;
}

}  // namespace
}  // namespace senseloom::tool
