#include "plot/record_hues.h"

#include <gtest/gtest.h>

#include <string>

#include "trace/hex.h"

namespace senseloom::tool {
namespace {

RecordHues look(const char* sensor, const std::string& value, bool isResult = false) {
  return huesOf(sensorNamed(sensor), *fromHex("0000000000000000" + value), isResult);
}

TEST(RecordHuesOf, ActivityAreThoseOfItsItems) {
  const RecordHues hues = look("PHYAC", "0300010011000900");
  EXPECT_EQ(hues.counts[1], 2U);
  EXPECT_EQ(hues.counts[9], 1U);
  EXPECT_EQ(hues.records, 1U);
  EXPECT_EQ(look("PHYAC", "0300010011").counts[1], 1U);  // ends before the second item
}

TEST(RecordHuesOf, ClassesAreTheirNumbersUpToSixteen) {
  EXPECT_EQ(look("GSFLK", "0700").counts[7], 1U);
  EXPECT_EQ(look("GSFLK", "1000").counts[16], 1U);
  EXPECT_EQ(look("GSFLK", "1100").counts[kOtherHue], 1U);
  EXPECT_EQ(look("GSFLK", "ffff").counts[kOtherHue], 1U);
  EXPECT_EQ(look("ISACT", "02000000").counts[2], 1U);
  EXPECT_EQ(look("GSFLK", "07").counts[kPlainHue], 1U);
}

TEST(RecordHuesOf, DrawnGesturesAreThoseOfResultsAlone) {
  EXPECT_EQ(look("GSPX", "0100", false).counts[kPlainHue], 1U);
  EXPECT_EQ(look("GSPX", "0100", true).counts[1], 1U);
}

TEST(RecordHuesOf, CountsAreHeights) {
  EXPECT_EQ(look("SCOUN", "64000000").height, 100U);
  EXPECT_EQ(look("SCOUN", "00000080").height, 2147483648U);
  EXPECT_EQ(look("PDR", "0300").height, 3U);
  EXPECT_EQ(look("PDR", "fdff").height, 3U);
  EXPECT_EQ(look("PDR", "03").height, 0U);  // too short for its number
}

TEST(HueText, NamesWhatAHueStandsFor) {
  const auto text = [](const char* sensor, size_t hue, const std::vector<std::string>& names = {}) {
    return hueText(sensorNamed(sensor), hue, names);
  };
  EXPECT_EQ(text("PHYAC", 1), "class 1");
  EXPECT_EQ(text("PHYAC", 1, {"still", "walking"}), "walking");
  EXPECT_EQ(text("PHYAC", 6, {"still"}), "class 6 (no majority)");
  EXPECT_EQ(text("GSFLK", 6), "class 6");
  EXPECT_EQ(text("STAP", 0), "no class");
  EXPECT_EQ(text("STAP", 3), "class 1 + 2");
  EXPECT_EQ(text("STAP", 12), "class 3 + 4");
  EXPECT_EQ(text("GSFLK", kOtherHue), "other class");
  EXPECT_EQ(text("SCOUN", kPlainHue), "steps");
  EXPECT_EQ(text("PDR", kPlainHue), "items");
  EXPECT_EQ(text("GSPX", kPlainHue), "no class");
}

}  // namespace
}  // namespace senseloom::tool
