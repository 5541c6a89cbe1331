#include "watch/screen_text.h"

#include <gtest/gtest.h>

namespace senseloom::tool {
namespace {

TEST(ScreenText, CountsCharactersAndNotBytes) {
  EXPECT_EQ(widthOf("abc"), 3U);
  EXPECT_EQ(widthOf("Größe €"), 7U);
  EXPECT_EQ(paddedBehind(5, "é€"), "é€   ");
  EXPECT_EQ(paddedInFront(5, "é€"), "   é€");
  EXPECT_EQ(paddedInFront(1, "é€"), "é€");
}

TEST(ScreenText, IsShortenedWithAnEllipsis) {
  EXPECT_EQ(shortenedTo(4, "walk"), "walk");
  EXPECT_EQ(shortenedTo(3, "walk"), "wa…");
  EXPECT_EQ(shortenedTo(3, "éé€é"), "éé…");
  EXPECT_EQ(shortenedTo(1, "walk"), "…");
  EXPECT_EQ(shortenedTo(0, "walk"), "");
}

TEST(ScreenText, CannotControlTheTerminal) {
  EXPECT_EQ(harmless("a\x1b[2Jb\r\n\x7f"), "a [2Jb   ");
  EXPECT_EQ(harmless("a\xC2\x9B"
                     "2Jb \xC2\xA9"),
            "a 2Jb ©");
}

}  // namespace
}  // namespace senseloom::tool
