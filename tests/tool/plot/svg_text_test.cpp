#include "plot/svg_text.h"

#include <gtest/gtest.h>

namespace senseloom::tool {
namespace {

TEST(SvgText, EscapesWhatXmlCannotHold) {
  EXPECT_EQ(xmlText("a<b>&\"c\""), "a&lt;b&gt;&amp;&quot;c&quot;");
  EXPECT_EQ(xmlText("a\tb\n\x01"), "a?b??");
  EXPECT_EQ(xmlText("\xC3\xA9\xEF\xBF\xBE\xEF\xBF\xBF\xEF\xBF\xBD"), "\xC3\xA9??\xEF\xBF\xBD");
}

TEST(SvgText, IsShortenedByCharacters) {
  EXPECT_EQ(shortened("name", 4), "name");
  EXPECT_EQ(shortened("names", 4), "name...");
  EXPECT_EQ(shortened("\xC3\xA9\xC3\xA9\xC3\xA9", 2), "\xC3\xA9\xC3\xA9...");
  EXPECT_EQ(shortened("", 4), "");
}

TEST(SvgText, RoundsCoordinates) {
  EXPECT_EQ(coordinate(3), "3");
  EXPECT_EQ(coordinate(3.04), "3");
  EXPECT_EQ(coordinate(3.06), "3.1");
  EXPECT_EQ(coordinate(-0.5), "-0.5");
}

TEST(SvgText, GroupsDigits) {
  EXPECT_EQ(grouped(0), "0");
  EXPECT_EQ(grouped(999), "999");
  EXPECT_EQ(grouped(1000), "1,000");
  EXPECT_EQ(grouped(18446744073709551615U), "18,446,744,073,709,551,615");
}

TEST(SvgText, FindsAxisSteps) {
  EXPECT_EQ(axisStep(8, 8), 1);
  EXPECT_EQ(axisStep(9, 8), 2);
  EXPECT_EQ(axisStep(35, 8), 5);
  EXPECT_EQ(axisStep(36000000, 8), 5000000);
  EXPECT_EQ(axisStep(70, 8), 10);
}

}  // namespace
}  // namespace senseloom::tool
