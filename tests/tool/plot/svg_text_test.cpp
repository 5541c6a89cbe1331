#include "plot/svg_text.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

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

TEST(SvgText, LongNamesLoseTheirMiddleAndStayDifferent) {
  EXPECT_EQ(shortenedApart({"nav", "seventeen letters", "com.example.navigation.first", "com.example.navigation.last",
                            "com.example.something.first"}),
            (std::vector<std::string>{"nav", "seventeen letters", "com.ex....first", "com.ex...n.last",
                                      "com.ex....first (2)"}));
  EXPECT_EQ(shortenedApart({"\xC3\xA4\xC3\xA4\xC3\xA4 twenty characters \xC3\xBC"}),
            std::vector<std::string>{"\xC3\xA4\xC3\xA4\xC3\xA4 tw...ters \xC3\xBC"});
}

}  // namespace
}  // namespace senseloom::tool
