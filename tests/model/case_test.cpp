#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <vector>

#include "call_reader.h"
#include "case_file.h"
#include "case_run.h"
#include "generator.h"
#include "input_error.h"

// The program that runs the cases: it must not overlook anything.
namespace oracle {
namespace {

const std::string kCase = R"({"case":"one","note":"why"})"
                          "\n";
const std::string kOpen = R"({"call":"open","session":"a","sensor":"STAP","returned":"handle"})"
                          "\n";

std::vector<Case> read(const std::string& text) {
  std::istringstream stream(text);
  return readCases(stream, "file");
}

// What is said of a file that is not as it should be.
std::string errorOf(const std::string& text) {
  try {
    read(text);
  } catch (const senseloom::tool::InputError& error) {
    return error.what();
  }
  return "none";
}
// ... because of the line after the opening of a session.
std::string errorOfLine(const std::string& line) {
  return errorOf(kCase + kOpen + line);
}

// What is said of a run; empty when all is as expected.
std::string ran(const std::string& lines) {
  return run(read(kCase + lines).front(), "file");
}

TEST(CaseFile, IsCasesWithTheirCallsAndTheirLines) {
  const auto cases = read(kCase + "\n" + kOpen + R"({"note":"between"})" + "\n" +
                          R"({"case":"two","note":"because"})"
                          "\n" +
                          kOpen);
  ASSERT_EQ(cases.size(), 2);
  EXPECT_EQ(cases[0].name, "one");
  EXPECT_EQ(cases[0].note, "why");
  ASSERT_EQ(cases[0].steps.size(), 1);
  EXPECT_EQ(cases[0].steps[0].lineNumber, 3);
  EXPECT_EQ(cases[0].steps[0].call.what, Call::open);
  EXPECT_EQ(cases[0].sessions, std::vector<std::string>{"a"});
  EXPECT_EQ(cases[1].lineNumber, 5);
}

TEST(CaseFile, NeedsANoteANameOfItsOwnAndCallsInEachCase) {
  EXPECT_EQ(errorOf(""), "file: no cases");
  EXPECT_EQ(errorOf(kOpen), "file:1: a call before the first case");
  EXPECT_EQ(errorOf(R"({"case":"one"})"), "file:1: case \"one\" has no note");
  EXPECT_EQ(errorOf(R"({"case":"one","note":""})"), "file:1: case \"one\" has no note");
  EXPECT_EQ(errorOf(R"({"case":"","note":"why"})"), "file:1: a case without a name");
  EXPECT_EQ(errorOf(kCase), "file:1: case \"one\" has no calls");
  EXPECT_EQ(errorOf(kCase + R"({"case":"two","note":"why"})"), "file:2: case \"one\" has no calls");
  EXPECT_EQ(errorOf(kCase + kOpen + kCase), "file:3: case \"one\" is there twice");
}

TEST(CaseFile, RefusesLinesThatAreNotCalls) {
  EXPECT_EQ(errorOfLine("nonsense").rfind("file:3: not JSON: ", 0), 0);
  EXPECT_EQ(errorOfLine(R"({"call":"close","call":"close"})").rfind("file:3: not JSON: ", 0), 0);
  EXPECT_EQ(errorOfLine("[]"), "file:3: not a JSON object");
  EXPECT_EQ(errorOfLine(R"({"call":"reopen"})"), "file:3: unknown call \"reopen\"");
  EXPECT_EQ(errorOfLine(R"({"session":"a"})"), "file:3: unknown member \"session\"");
  EXPECT_EQ(errorOfLine(R"({"call":"close","session":"b","returned":0})"), "file:3: session \"b\" was never opened");
  EXPECT_EQ(errorOfLine(R"({"call":"close","session":"","returned":0})"), "file:3: \"session\" must not be empty");
  EXPECT_EQ(errorOfLine(R"({"call":"close","returned":0})"), "file:3: missing \"session\"");
  EXPECT_EQ(errorOfLine(R"({"call":"open","session":"b","returned":null})"), "file:3: missing \"sensor\"");
  EXPECT_EQ(errorOfLine(R"({"call":"dispatch","sensor":"TAP","record":{"hex":""},"returned":0})"),
            "file:3: unknown sensor \"TAP\"");
  EXPECT_EQ(errorOfLine(R"({"call":"dispatch","session":"a","returned":0})"), "file:3: \"record\" must be an object");
  EXPECT_EQ(errorOfLine(R"({"call":"dispatch","session":"a","record":{"steps":1},"returned":0})"),
            "file:3: unknown record field \"steps\"; the nearest is \"classes\"");
  EXPECT_EQ(errorOfLine(R"({"call":"set_option","session":"a","option":1,"returned":0})"),
            "file:3: \"option\" must be an object, a string or null");
  EXPECT_EQ(errorOfLine(R"({"call":"set_option","session":"a","optionHex":"1","returned":0})"),
            "file:3: \"optionHex\" must hold hexadecimal digits, two a byte");
}

TEST(CaseFile, RefusesMembersThatNothingWouldLookAt) {
  EXPECT_EQ(errorOf(R"({"case":"one","note":"why","log":[]})"), "file:1: unknown member \"log\"");
  EXPECT_EQ(errorOfLine(R"({"note":"one","properties":{}})"), "file:3: unknown member \"properties\"");
  EXPECT_EQ(errorOfLine(R"({"call":"close","session":"a","return":0})"), "file:3: unknown member \"return\"");
  EXPECT_EQ(errorOfLine(R"({"call":"close","session":"a"})"), "file:3: missing \"returned\"");
  EXPECT_EQ(errorOfLine(R"({"call":"close","session":"a","returned":0,"result":"own record"})"),
            "file:3: unknown member \"result\"");
  EXPECT_EQ(errorOfLine(R"({"call":"uninit","returned":0})"), "file:3: unknown member \"returned\"");
  EXPECT_EQ(errorOfLine(R"({"call":"getSensor","sensor":"STAP","session":"a","returned":"sensor"})"),
            "file:3: unknown member \"session\"");
  EXPECT_EQ(errorOfLine(R"({"call":"close","session":"a","misuse":"old handle","returned":0})"),
            "file:3: unknown misuse \"old handle\"");
  EXPECT_EQ(errorOfLine(R"({"call":"close","session":"a","platform":{"closes":1},"returned":0})"),
            "file:3: unknown answer of the platform \"closes\"");
  EXPECT_EQ(errorOfLine(R"({"call":"close","session":"a","platform":{"get":"1"},"returned":0})"),
            "file:3: \"get\" must be an integer");
  EXPECT_EQ(errorOfLine(R"({"call":"close","session":"a","platform":{"gives":1},"returned":0})"),
            "file:3: \"gives\" must be true or false");
  EXPECT_EQ(errorOfLine(R"({"call":"close","session":"a","platform":{"names":[1]},"returned":0})"),
            "file:3: \"names\" must hold strings and null");
  EXPECT_EQ(errorOfLine(R"({"call":"close","session":"a","platform":[],"returned":0})"),
            "file:3: \"platform\" must be an object");
  EXPECT_EQ(errorOfLine(R"({"look":"a"})"), "file:3: \"look\" must name a sensor");
}

TEST(CaseFile, RepeatsTextAndElements) {
  const auto cases = read(kCase + kOpen +
                          R"({"call":"set_option","session":"a","option":"<3 ab>< 2 c><2d><2 >","returned":-1})"
                          "\n"
                          R"({"call":"dispatch","sensor":"PHYAC","returned":0,"record":{"timestamp":1,"items":[)"
                          R"({"times":2,"of":{"class":1,"seq":0}},{"class":2,"seq":0}]}})");
  EXPECT_EQ(cases[0].steps[1].call.option.text(), "ababab< 2 c><2d>");
  EXPECT_EQ(cases[0].steps[2].call.record, (Bytes{1, 0, 0, 0, 0, 0, 0, 0, 3, 0, 1, 0, 1, 0, 2, 0}));
}

TEST(CaseReader, ReadsWhatIsWrittenOfGeneratedCalls) {
  for (uint64_t seed = 0; seed < 300; ++seed) {
    RandomChoices choices(seed);
    CallReader reader;
    const auto readAgain = [&](const Call& call) {
      const senseloom::tool::Json json(json_loads(toJson(call).c_str(), 0, nullptr));
      return toJson(reader.read(json.get()));
    };
    Call open;
    open.what = Call::open;
    for (open.session = 0; open.session < 10; ++open.session) readAgain(open);
    for (const Call& call : makeSequence(choices)) ASSERT_EQ(readAgain(call), toJson(call)) << "seed " << seed;
  }
}

// A case of one session with this option, and what it is expected to do.
const std::string kMask1 =
    R"({"call":"set_option","session":"a","option":{"classMask":1},"returned":0,"properties":{"classMask":1,"level":0}})"
    "\n";

TEST(CaseRun, SaysNothingWhenAllIsAsExpected) {
  EXPECT_EQ(ran(kOpen + kMask1), "");
}

TEST(CaseRun, TellsWhereWhyAndWhatIsOtherwise) {
  EXPECT_EQ(ran(kOpen + R"({"call":"set_option","session":"a","option":{"level":6},"returned":0,)"
                        R"("properties":{"classMask":3,"level":0}})"),
            "file:3: one (why)\n"
            R"(  {"call":"set_option","session":"a","option":{"level":6},"returned":0,)"
            R"("properties":{"classMask":3,"level":0}})"
            "\n"
            "  library: \"properties\"\n"
            R"(    expected {"classMask":3,"level":0})"
            "\n"
            R"(    actual   {"classMask":0,"level":6})"
            "\n"
            "  library: \"log\"\n"
            "    expected nothing\n"
            R"(    actual   ["E/libsenseloom: tapping: invalid level value 6"])"
            "\n"
            "  model: \"properties\"\n"
            R"(    expected {"classMask":3,"level":0})"
            "\n"
            R"(    actual   {"classMask":0,"level":6})"
            "\n"
            "  model: \"log\"\n"
            "    expected nothing\n"
            R"(    actual   ["E/libsenseloom: tapping: invalid level value 6"])"
            "\n");
}

// A line of which one thing is wrong, after the opening of "a" on a sensor, and which.
struct Wrong {
  const char* sensor;
  const char* line;
  const char* member;
};

// A line on an open session "a" of the sensor, and the member that is wrong there.
const Wrong kWrongLines[] = {
    {"STAP", R"({"call":"set_option","session":"a","option":{},"returned":1,"properties":{"classMask":3,"level":0}})",
     "returned"},
    {"STAP", R"({"call":"set_option","session":"a","option":{},"returned":0})", "properties"},
    {"STAP", R"({"call":"set_option","session":"a","option":{},"returned":0,"properties":{"classMask":3}})",
     "properties"},
    {"STAP", R"({"call":"set_option","session":"a","option":{},"returned":0,"properties":{"level":0,"classMask":3}})",
     "properties"},
    {"STAP", R"({"call":"set_option","session":"a","option":{},"returned":0,"properties":[]})", "properties"},
    {"STAP", R"({"call":"set_option","session":"a","option":"{","returned":-1,"properties":{}})", "properties"},
    {"STAP", R"({"call":"set_option","session":"a","option":"{","returned":-1,"out":"untouched"})", "out"},
    {"STAP", R"({"call":"set_option","session":"a","option":null,"returned":-1})", "out"},
    {"STAP",
     R"({"call":"set_option","session":"a","option":{},"returned":0,"properties":{"classMask":3,"level":0},)"
     R"("log":[]})",
     "log"},
    {"STAP",
     R"({"call":"set_option","session":"a","option":{},"returned":0,"properties":{"classMask":3,"level":0},)"
     R"("log":["I/Libsl: The 0 of 1 session of sensor STAP has {b} option!\n"]})",
     "log"},
    {"SHAKI", R"({"call":"set_option","session":"a","option":"","returned":-1})", "log"},
    {"SHAKI",
     R"({"call":"set_option","session":"a","option":"","returned":-1,)"
     R"("log":["D/libsenseloom: shaking: invalid opton string , all set as default"]})",
     "log"},
    {"SHAKI",
     R"({"call":"set_option","session":"a","option":"","returned":-1,)"
     R"("log":["E/STY: shaking: invalid opton string , all set as default"]})",
     "log"},
    {"SHAKI", R"({"call":"dispatch","session":"a","record":{"hex":"00"},"returned":1})", "result"},
    {"SHAKI", R"({"call":"dispatch","session":"a","record":{"hex":"00"},"returned":1,"result":{"hex":"00"}})",
     "result"},
    {"PDR",
     R"({"call":"dispatch","session":"a","record":{"timestamp":1,"items":["<28 01>"]},"returned":1,)"
     R"("result":"own record"})",
     "result"},
    {"PDR",
     R"({"call":"dispatch","session":"a","record":{"timestamp":1,"items":["<28 01>"]},"returned":1,)"
     R"("result":{"timestamp":1,"items":["<27 01>02"]}})",
     "result"},
    {"PDR",
     R"({"call":"dispatch","session":"a","record":{"timestamp":1,"items":["<28 01>"]},"returned":1,)"
     R"("result":{"hex":"01"}})",
     "result"},
    {"STAP",
     R"({"call":"dispatch","session":"a","record":{"timestamp":1,"classes":0},"returned":0,)"
     R"("result":"own record"})",
     "result"},
    {"STAP", R"({"call":"audio_hal_init","returned":true,"log":[],"platformCalls":[]})", "platformCalls"},
    {"STAP", R"({"call":"audio_hal_init","returned":false,"log":[],"platformCalls":[]})", "returned"},
    {"STAP", R"({"call":"open","session":"g","sensor":"GSPX","returned":"handle"})", "platformCalls"},
    {"STAP", R"({"call":"open","session":"g","sensor":"GSPX","returned":null})", "returned"},
    {"STAP", R"({"call":"getSensor","sensor":"STAP","returned":null})", "returned"},
    {"STAP", R"({"call":"uninit","device":"open"})", "device"},
    {"STAP", R"({"call":"uninit","platformCalls":["close"]})", "platformCalls"},
    {"STAP", R"({"call":"close","session":"a","returned":1})", "returned"},
};

TEST(CaseRun, OverlooksNothing) {
  for (const auto& [sensor, line, member] : kWrongLines) {
    const std::string open =
        std::string(R"({"call":"open","session":"a","returned":"handle","sensor":")") + sensor + "\"}\n";
    EXPECT_NE(ran(open + line).find(std::string("library: \"") + member + '"'), std::string::npos) << line << '\n'
                                                                                                   << ran(open + line);
  }
}

// The opening of a gesture session, and the beginning of a dispatch whose log is as expected.
const std::string kOpenGestures =
    R"({"call":"open","session":"a","sensor":"GSPX","returned":"handle","platformCalls":["gesture_initial"]})"
    "\n";
const std::string kFeed =
    R"({"call":"dispatch","session":"a","record":{"timestamp":1,"prx":0,"samples":[[1,2,3,4,5,6]]},)"
    R"("log":["D/libsenseloom: num 0: 1 2 3 4 5 6: last 1, size 12, prx 0\n")";

TEST(CaseRun, ComparesWhatTheEngineIsFed) {
  const std::string dropped = kOpenGestures + kFeed + R"(],"returned":0)";
  EXPECT_EQ(ran(dropped + R"(,"groups":[[1,2,3,4,5,6]]})"), "");
  EXPECT_NE(ran(dropped + R"(,"groups":[[1,2,3,4,5,7]]})").find("library: \"groups\""), std::string::npos);
  EXPECT_NE(ran(dropped + "}").find("library: \"groups\""), std::string::npos);
}

// The class is one field of such a result: the record's samples have to be there, too.
TEST(CaseRun, ComparesTheWholeResultOfAGesture) {
  const std::string delivered = kOpenGestures + kFeed +
                                R"(,"D/libsenseloom: -- gesture: LetterA "],"platform":{"names":["LetterA "]},)"
                                R"("groups":[[1,2,3,4,5,6]],"returned":1,"result":)";
  EXPECT_EQ(ran(delivered + R"({"timestamp":1,"class":11}})"), "");
  EXPECT_NE(ran(delivered + R"({"timestamp":1,"class":12}})"), "");
  EXPECT_NE(ran(delivered + R"({"timestamp":2,"class":11}})"), "");
}

TEST(CaseRun, WantsSessionsOpenedOnceAndClosedBeforeTheirHandlesAreStale) {
  EXPECT_NE(ran(kOpen + kOpen).find("the session is open already"), std::string::npos);
  const std::string close = R"({"call":"close","session":"a","returned":0})"
                            "\n";
  EXPECT_NE(ran(kOpen + close + close).find("the session is not open"), std::string::npos);
  EXPECT_NE(ran(kOpen + R"({"call":"close","session":"a","misuse":"stale handle","returned":-1})")
                .find("the session is still open"),
            std::string::npos);
  EXPECT_EQ(ran(kOpen + close + R"({"call":"close","session":"a","misuse":"stale handle","returned":-1})"), "");
}

TEST(CaseRun, LooksAtTheLastListOfASensorAgain) {
  const std::string look = R"({"look":"STAP","properties":{"classMask":1,"level":0}})";
  EXPECT_EQ(ran(kOpen + kMask1 + look), "");
  EXPECT_NE(ran(kOpen + kMask1 + R"({"look":"STAP","properties":{"classMask":2,"level":0}})"), "");
  EXPECT_NE(ran(kOpen + look).find("there was no list"), std::string::npos);
}

TEST(CaseRun, EachCaseStartsFromTheLibraryAsLoaded) {
  const std::string active = R"({"call":"audio_hal_init","returned":true,"device":"open","log":[)"
                             R"_("D/aware_audio: bool audio_hal_init() load audio hw module aware.primary (Success)",)_"
                             R"("D/aware_audio: device open result 0\n","D/aware_audio: device version 512\n"],)"
                             R"("platformCalls":["get aware.primary","open aware_hw_if"]})";
  for (int time = 0; time < 2; ++time) EXPECT_EQ(ran(kOpen + kMask1 + active), "");
}

}  // namespace
}  // namespace oracle
