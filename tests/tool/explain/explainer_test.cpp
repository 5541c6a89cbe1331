#include "explain/explainer.h"

#include <android/log.h>
#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <utility>
#include <vector>

#include "explain/explanation_text.h"
#include "printed.h"

namespace senseloom::tool {
namespace {

// Tells an explainer of calls of session "a" on a sensor, as if a library had returned what the test says.
class Explaining {
 public:
  Explaining(std::FILE* out, const char* sensor)
      : layout(findSensor(sensor)), output(out, {}), explainer(output, log) {}

  void open(bool opens = true) {
    explainer.onOutcome({.call = callOf(CallKind::open), .session = name, .sensor = layout, .failed = !opens});
  }
  void set(const std::string& option, int returned, std::optional<PropertyList> properties) {
    TraceCall call = callOf(CallKind::setOption);
    call.option = option;
    explainer.onOutcome({.call = call,
                         .session = name,
                         .sensor = layout,
                         .failed = returned < 0,
                         .returned = returned,
                         .properties = std::move(properties)});
  }
  // What is delivered is the record itself, but for what the test says.
  void dispatch(const std::vector<uint8_t>& record, int returned) { dispatch(record, returned, record); }
  void dispatch(const std::vector<uint8_t>& record, int returned, const std::vector<uint8_t>& delivered) {
    const auto result = returned == 1 ? std::optional<std::span<const uint8_t>>(delivered) : std::nullopt;
    explainer.onOutcome({.call = callOf(CallKind::dispatch),
                         .session = name,
                         .sensor = layout,
                         .failed = returned < 0,
                         .returned = returned,
                         .result = result,
                         .record = record});
  }
  void end() { explainer.onEnd(); }

 private:
  static TraceCall callOf(CallKind kind) {
    TraceCall call;
    call.line = 7;
    call.kind = kind;
    return call;
  }

  const std::string name = "a";
  const Sensor* layout;
  LogCapture log;
  ExplanationText output;
  Explainer explainer;
};

Property property(int32_t id, uint8_t value) {
  return {id, {value, 0, 0, 0}};
}

std::string explained(const char* sensor, const std::function<void(Explaining&)>& calls) {
  return printed([&](std::FILE* out) {
    Explaining explaining(out, sensor);
    explaining.open();
    calls(explaining);
  });
}

const std::vector<uint8_t> kSingleTap{0, 0, 0, 0, 0, 0, 0, 0, 1, 0};
constexpr char kHeading[] = "line 7: a on STAP sets {\"level\":1}\n";
constexpr char kTable[] =
    "  key        merged to   a          merged  property  decided by\n"
    "  classMask  bitwise or  3 default  3       101 = 3   a\n"
    "  level      minimum     1          1       102 = 1   a\n";

TEST(Explainer, HasNothingUnexplainedWhenTheLibraryAgrees) {
  EXPECT_EQ(explained("STAP",
                      [](Explaining& a) {
                        a.set(R"({"level":1})", 0, {{property(101, 3), property(102, 1)}});
                      }),
            std::string(kHeading) + kTable);
}

TEST(Explainer, SaysWhichPropertyIsUnexplained) {
  EXPECT_EQ(explained("STAP",
                      [](Explaining& a) {
                        a.set(R"({"level":1})", 0, {{property(101, 2), property(102, 1)}});
                      }),
            std::string(kHeading) +
                "  key        merged to   a          merged  property  decided by\n"
                "  classMask  bitwise or  3 default  3       101 = 2   a\n"
                "  level      minimum     1          1       102 = 1   a\n"
                "  unexplained: property 101 = 2, where 101 = 3 was derived\n");
}

TEST(Explainer, SaysWhenPropertiesAreMissingOrTooMany) {
  const std::string fewer = explained("STAP", [](Explaining& a) { a.set(R"({"level":1})", 0, {{property(101, 3)}}); });
  EXPECT_NE(fewer.find("  unexplained: property nothing, where 102 = 1 was derived\n"), std::string::npos) << fewer;
  const std::string more = explained("GSPX", [](Explaining& a) { a.set("{}", 0, {{property(9, 3)}}); });
  EXPECT_NE(more.find("  unexplained: property 9 = 3, where nothing was derived\n"), std::string::npos) << more;
}

TEST(Explainer, SaysWhenALibraryRefusesWithoutAReason) {
  EXPECT_EQ(explained("STAP", [](Explaining& a) { a.set(R"({"level":1})", -1, std::nullopt); }),
            std::string(kHeading) +
                "  key        merged to   a          merged  property  decided by\n"
                "  classMask  bitwise or  3 default  3                 a\n"
                "  level      minimum     1          1                 a\n"
                "  unexplained: the library returned no property list\n"
                "  unexplained: the library returned -1, where 0 was derived\n");
}

TEST(Explainer, SaysWhenALibraryAcceptsWhatItShouldRefuse) {
  EXPECT_EQ(explained("STAP", [](Explaining& a) { a.set("{", 0, std::nullopt); }),
            "line 7: a on STAP sets {\n"
            "  not JSON (string or '}' expected near end of file): refused\n"
            "  unexplained: the library returned 0, where -1 was derived\n");
}

TEST(Explainer, SaysWhenAnExpectedLogLineIsMissing) {
  const std::string text = explained("STAP", [](Explaining& a) {
    a.set(R"({"classMask":4,"level":1})", 0, {{property(101, 3), property(102, 1)}});
  });
  EXPECT_NE(text.find("  \"classMask\" 4 is not in 1..3: 3 is used\n"
                      "  unexplained: the library did not log: tapping: invalid clsmask value 4\n"),
            std::string::npos)
      << text;
}

TEST(Explainer, PrintsLogLinesThatItDidNotExpect) {
  const std::string text = explained("STAP", [](Explaining& a) {
    __android_log_print(ANDROID_LOG_INFO, "Libsl", "the negotiation itself\n");
    __android_log_print(ANDROID_LOG_DEBUG, "other", "a surprise\n");
    a.set(R"({"level":1})", 0, {{property(101, 3), property(102, 1)}});
  });
  EXPECT_EQ(text, std::string(kHeading) + kTable + "  logged: other: a surprise\n");
}

TEST(Explainer, SaysWhichRecordIsUnexplainedAndCountsIt) {
  EXPECT_EQ(explained("STAP",
                      [](Explaining& a) {
                        a.dispatch(kSingleTap, 1);
                        a.dispatch(kSingleTap, 0);
                        a.dispatch(kSingleTap, -1);
                        a.end();
                      }),
            "line 7: a on STAP unexplained: the library returned 0, where this was derived: delivered\n"
            "line 7: a on STAP unexplained: the library returned -1, where this was derived: delivered\n"
            "\n"
            "what became of the records\n"
            "  session  sensor  records  delivered  unexplained\n"
            "  a        STAP          3          1            2\n");
}

TEST(Explainer, SaysWhenOtherBytesAreDelivered) {
  EXPECT_EQ(explained("STAP",
                      [](Explaining& a) {
                        a.dispatch(kSingleTap, 1, {1, 0, 0, 0, 0, 0, 0, 0, 1, 0});
                        a.dispatch(kSingleTap, 1, {0, 0, 0, 0, 0, 0, 0, 0, 1});
                        a.end();
                      }),
            "line 7: a on STAP unexplained: the library delivered other bytes than were derived\n"
            "line 7: a on STAP unexplained: the library delivered other bytes than were derived\n"
            "\n"
            "what became of the records\n"
            "  session  sensor  records  delivered  unexplained\n"
            "  a        STAP          2          0            2\n");
}

TEST(Explainer, SaysWhenASessionOpensOrNotWithoutAReason) {
  EXPECT_EQ(printed([](std::FILE* out) {
              Explaining a(out, "STAP");
              a.open(false);
            }),
            "line 7: a on STAP does not open\n"
            "  unexplained: the library opened no session, where one was derived\n");
  EXPECT_EQ(printed([](std::FILE* out) {
              Explaining a(out, "LPE_P");
              __android_log_print(ANDROID_LOG_ERROR, "aware_audio", "activated aware failed\n");
              a.open();
            }),
            "line 7: a on LPE_P opens\n"
            "  the platform's audio session cannot be switched on: the device refuses\n"
            "    logged: activated aware failed\n"
            "  unexplained: no session was derived\n");
}

TEST(Explainer, TakesALineThatThePlatformCutAsLogged) {
  const std::string text(2000, 'x');
  const std::string line = "gestureflick: invalid opton string " + text;
  const std::string explanation = explained("GSFLK", [&](Explaining& a) {
    __android_log_print(ANDROID_LOG_ERROR, "libsenseloom", "%s", line.substr(0, 1023).c_str());
    a.set(text, -1, std::nullopt);
  });
  EXPECT_EQ(explanation.find("unexplained"), std::string::npos) << explanation;
}

TEST(LogCapture, GivesBackTheLogWhenItIsGone) {
  LogCapture().take();
  testing::internal::CaptureStderr();
  __android_log_print(ANDROID_LOG_ERROR, "tag", "printed again");
  EXPECT_NE(testing::internal::GetCapturedStderr().find("printed again"), std::string::npos);
}

}  // namespace
}  // namespace senseloom::tool
