#include "explain/option_reading.h"

#include <gtest/gtest.h>

#include <string>

namespace senseloom::tool {
namespace {

class OptionReadingOf : public testing::Test {
 protected:
  OptionReading read(const char* sensor, const std::string& text) {
    return readOption(*findOptionDescription(sensor), text, templates);
  }

  TemplateLengths templates{};
};

std::string textOf(const OptionReading& reading) {
  std::string text;
  for (const Remark& remark : reading.remarks) {
    text += remark.text + '\n';
    if (!remark.logged.empty()) text += "  " + remark.logged + '\n';
  }
  return text;
}

TEST_F(OptionReadingOf, AllKeysGivenHasNothingToRemark) {
  const OptionReading reading = read("STAP", R"({"classMask":1,"level":-5})");
  EXPECT_TRUE(reading.accepted);
  ASSERT_TRUE(reading.wishes);
  EXPECT_EQ((*reading.wishes)["classMask"].text(), "1");
  EXPECT_EQ((*reading.wishes)["level"].text(), "-5");
  EXPECT_EQ(textOf(reading), "");
}

TEST_F(OptionReadingOf, MissingKeysMarksTheirDefaults) {
  const OptionReading reading = read("STAP", "{}");
  EXPECT_EQ((*reading.wishes)["classMask"].text(), "3 default");
  EXPECT_EQ((*reading.wishes)["level"].text(), "0 default");
  EXPECT_EQ(textOf(reading), "");
}

TEST_F(OptionReadingOf, TyposNamesTheNearestKnownKey) {
  EXPECT_EQ(textOf(read("STAP", R"({"clsmask":1,"levle":2})")),
            "unknown key \"clsmask\" has no effect: the nearest known key is \"classMask\"\n"
            "unknown key \"levle\" has no effect: the nearest known key is \"level\"\n");
  EXPECT_EQ(textOf(read("DTWGS", R"({"mode":1,"template":"0000"})")),
            "unknown key \"template\" has no effect: the nearest known key is \"template1\"\n");
}

TEST_F(OptionReadingOf, OtherTypesCountsThemAsNotGiven) {
  const OptionReading reading = read("STAP", R"({"classMask":"1","level":2.0})");
  EXPECT_EQ((*reading.wishes)["classMask"].text(), "3 default");
  EXPECT_EQ((*reading.wishes)["level"].text(), "0 default");
  EXPECT_EQ(textOf(reading),
            "\"classMask\" is no integer and counts as not given\n"
            "\"level\" is no integer and counts as not given\n");
}

TEST_F(OptionReadingOf, ALargeIntegerCutsItTo32Bits) {
  const OptionReading reading = read("LPE_P", R"({"interval":4294967297})");
  EXPECT_EQ(reading.wishes->valueOf("interval"), 1);
  EXPECT_EQ(textOf(reading), "\"interval\" 4294967297 is cut to 32 bits, 1\n");
}

TEST_F(OptionReadingOf, AnArrayHasAllDefaults) {
  const OptionReading reading = read("SCOUN", "[1]");
  EXPECT_TRUE(reading.accepted);
  EXPECT_EQ(reading.wishes->valueOf("mode"), 1);
  EXPECT_EQ(textOf(reading), "not an object, so that every key has its default\n");
}

TEST_F(OptionReadingOf, ABadTappingLevelKeepsItAndEmptiesTheMask) {
  const OptionReading reading = read("STAP", R"({"classMask":4,"level":6})");
  EXPECT_EQ((*reading.wishes)["classMask"].text(), "0 for 4");
  EXPECT_EQ((*reading.wishes)["level"].text(), "6");
  EXPECT_EQ(textOf(reading),
            "\"classMask\" 4 is not in 1..3: 3 is used\n"
            "  tapping: invalid clsmask value 4\n"
            "\"level\" 6 is not in -5..5: 6 is kept\n"
            "  tapping: invalid level value 6\n"
            "the bad \"level\" sets \"classMask\" to 0: no tap is delivered\n");
}

TEST_F(OptionReadingOf, AMissingTappingMaskWithABadLevelShowsBoth) {
  EXPECT_EQ((*read("STAP", R"({"level":-6})").wishes)["classMask"].text(), "0 for default 3");
}

TEST_F(OptionReadingOf, LiftRejectsEveryMask) {
  EXPECT_EQ(textOf(read("LIFT", R"({"classMask":1})")),
            "\"classMask\" 1 is not taken, as no value is: 3 is used\n"
            "  tapping: invalid clsmask value 1\n");
  EXPECT_EQ(textOf(read("LIFT", "{}")),
            "\"classMask\" is not given: its default is kept, and logged as a bad value\n"
            "  tapping: invalid clsmask value 3\n");
}

TEST_F(OptionReadingOf, DeadReckoningLogsItsDefaults) {
  const OptionReading reading = read("PDR", R"({"N":7})");
  EXPECT_EQ((*reading.wishes)["userHeight"].text(), "1000 default");
  EXPECT_EQ((*reading.wishes)["N"].text(), "0 for 7");
  EXPECT_EQ(textOf(reading),
            "\"userHeight\" is not given: its default is kept, and logged as a bad value\n"
            "  PDR: invalid user height value 1000\n"
            "\"floorHeight\" is not given: its default is kept, and logged as a bad value\n"
            "  PDR: invalid floor height value 5000\n"
            "\"N\" 7 is not in 0..6: 0 is used\n"
            "  PDR: invalid N value 7\n"
            "\"6DOF\" is not given: its default is kept, and logged as a bad value\n"
            "  PDR: invalid 6DOF value 2\n");
}

TEST_F(OptionReadingOf, ActivityCorrectsWithoutALogLine) {
  const OptionReading reading =
      read("PHYAC", R"({"logN":12,"logM":9,"classMask":256,"summary":7,"weightVar":-5,"continuous":7})");
  EXPECT_EQ((*reading.wishes)["logN"].text(), "8 for 12");
  EXPECT_EQ((*reading.wishes)["logM"].text(), "8 for 9");
  EXPECT_EQ((*reading.wishes)["classMask"].text(), "-1 for 256");
  EXPECT_EQ((*reading.wishes)["summary"].text(), "1 for 7");
  EXPECT_EQ((*reading.wishes)["weightVar"].text(), "-1 for -5");
  EXPECT_EQ((*reading.wishes)["continuous"].text(), "1 for 7");
  EXPECT_EQ(textOf(reading),
            "\"logN\" 12 is not in 0..8: 8 is used\n"
            "\"logM\" 9 is not in 0..8: 8 is used\n"
            "\"classMask\" 256 is not in -1..255: -1 is used\n"
            "\"summary\" 7 is not in 0..1: 1 is used\n"
            "\"weightVar\" -5 is not in 0..: -1 is used\n"
            "\"continuous\" 7 is not in 0..1: 1 is used\n");
}

TEST_F(OptionReadingOf, ActivityCutsLogMToLogN) {
  const OptionReading reading = read("PHYAC", R"({"logN":3,"logM":5})");
  EXPECT_EQ((*reading.wishes)["logM"].text(), "3 for 5");
  EXPECT_EQ(textOf(reading), "\"logM\" is cut to \"logN\", 3\n");
}

TEST_F(OptionReadingOf, TextThatIsNoJsonIsRefusedByMostSensors) {
  for (const char* sensor : {"PHYAC", "STAP", "GSFLK", "SHAKI", "GSPX", "DTWGS", "GSETH", "LPE_P", "PDR", "LIFT"}) {
    const OptionReading reading = read(sensor, "{");
    EXPECT_FALSE(reading.accepted) << sensor;
    EXPECT_FALSE(reading.wishes) << sensor;
  }
  EXPECT_EQ(read("GSFLK", "{").remarks.at(0).logged, "gestureflick: invalid opton string {, all set as default");
  EXPECT_EQ(read("STAP", "{").remarks.at(0).logged, "");
}

TEST_F(OptionReadingOf, TextThatIsNoJsonIsAcceptedByTwo) {
  for (const char* sensor : {"ISACT", "SCOUN"}) {
    const OptionReading reading = read(sensor, "{");
    EXPECT_TRUE(reading.accepted) << sensor;
    EXPECT_FALSE(reading.wishes) << sensor;
  }
}

TEST_F(OptionReadingOf, ANullPointerIsRefused) {
  const OptionReading reading = readOption(*findOptionDescription("ISACT"), std::nullopt, templates);
  EXPECT_FALSE(reading.accepted);
  EXPECT_EQ(textOf(reading), "a null pointer is refused\n");
}

TEST_F(OptionReadingOf, TemplateGesturesRefusesTheWholeOptionForOneValue) {
  EXPECT_EQ(textOf(read("DTWGS", R"({"mode":2,"classMask":1})")),
            "\"mode\" must be 1 (enroll) or 4 (match): the whole option is refused\n"
            "  Invalid mode value 2\n");
  EXPECT_EQ(textOf(read("DTWGS", R"({"mode":4,"level":5})")),
            "\"classMask\" 0 is not in 1..3: the whole option is refused\n"
            "  Invalid mask value 0 at match mode\n");
  EXPECT_EQ(textOf(read("DTWGS", R"({"mode":4,"classMask":1,"level":2})")),
            "\"level\" 2 is not in -1..1: the whole option is refused\n"
            "  Invalid level value 2 at match mode\n");
  EXPECT_EQ(textOf(read("DTWGS", R"({"mode":1,"index":2})")),
            "\"index\" 2 is not in 0..1: the whole option is refused\n"
            "  Invalid index value 2 at enroll mode\n");
  EXPECT_TRUE(read("DTWGS", R"({"mode":1,"classMask":0,"level":2})").accepted);
  EXPECT_TRUE(read("DTWGS", R"({"mode":4,"classMask":3,"index":7})").accepted);
}

TEST_F(OptionReadingOf, TemplateGesturesStoresTemplatesEvenOfARefusedOption) {
  EXPECT_FALSE(read("DTWGS", R"({"mode":9,"template1":"0003a1b2c3","template2":"0384"})").accepted);
  EXPECT_EQ(templates[0], 3U);
  EXPECT_EQ(templates[1], 900U);
}

TEST_F(OptionReadingOf, TemplateGesturesRefusesTemplatesThatCanNotBeStored) {
  for (const char* text : {"000", "0385", "///0"}) {
    EXPECT_EQ(textOf(read("DTWGS", std::string(R"({"mode":4,"classMask":1,"template2":")") + text + "\"}")),
              "\"template2\" is no template of at most 900 bytes: the whole option is refused\n"
              "  Invalid template2 value\n")
        << text;
  }
  std::string tooLong = R"({"mode":1,"template1":"0001)";
  tooLong.append(1802, 'a').append("\"}");
  EXPECT_FALSE(read("DTWGS", tooLong).accepted);
  EXPECT_EQ(templates[0], 0U);
  EXPECT_EQ(textOf(read("DTWGS", R"({"mode":1,"template1":5})")),
            "\"template1\" is no string and counts as not given\n");
}

}  // namespace
}  // namespace senseloom::tool
