#include "trace/trace_line.h"

#include <gtest/gtest.h>

#include <array>
#include <cstdint>
#include <string_view>

namespace senseloom::tool {
namespace {

TEST(TraceLine, JoinsMembersInTheirOrder) {
  TraceLine line;
  EXPECT_TRUE(line.isEmpty());
  line.addText("call", "open");
  line.addInteger("returned", -1);
  line.addNull("sensor");
  line.addBytes("record", std::array<uint8_t, 3>{0, 0xa1, 0xff});
  EXPECT_FALSE(line.isEmpty());
  EXPECT_EQ(line.finish(), R"({"call":"open","returned":-1,"sensor":null,"record":{"hex":"00a1ff"}})"
                           "\n");
  line.clear();
  EXPECT_TRUE(line.isEmpty());
}

std::string_view textLine(TraceLine& line, std::string_view text) {
  line.clear();
  line.addText("option", text);
  return line.finish();
}

TEST(TraceLine, EscapesWhatAStringCannotHold) {
  TraceLine line;
  EXPECT_EQ(textLine(line, ""), "{\"option\":\"\"}\n");
  EXPECT_EQ(textLine(line, "{\"a\\b\": /~\x7f}"), "{\"option\":\"{\\\"a\\\\b\\\": /~\x7f}\"}\n");
  EXPECT_EQ(textLine(line, "\x01\n\x1f"), "{\"option\":\"\\u0001\\u000a\\u001f\"}\n");
}

TEST(TraceLine, HasTheBytesOfATextBeyondAscii) {
  TraceLine line;
  EXPECT_EQ(textLine(line, "\x80"), "{\"optionHex\":\"80\"}\n");
  EXPECT_EQ(textLine(line, "{\xc3\xa4"), "{\"optionHex\":\"7bc3a4\"}\n");
}

TEST(TraceLine, HasTheValuesOfPropertiesAsBytes) {
  TraceLine line;
  line.beginArray("properties");
  line.endArray();
  EXPECT_EQ(line.finish(), "{\"properties\":[]}\n");

  line.clear();
  line.beginArray("properties");
  line.addProperty(122, std::array<uint8_t, 4>{0xfe, 0xff, 0xff, 0xff});
  line.addProperty(123, std::array<uint8_t, 3>{1, 2, 0xfe});
  line.endArray();
  EXPECT_EQ(line.finish(),
            R"({"properties":[{"id":122,"size":4,"value":"feffffff"},{"id":123,"size":3,"value":"0102fe"}]})"
            "\n");
}

TEST(TraceLine, SaysWhatTheGestureEngineAnswered) {
  TraceLine line;
  line.addEngine({});
  EXPECT_EQ(line.finish(), "{\"engine\":[]}\n");

  line.clear();
  line.addEngine(std::array<EngineAnswer, 2>{{{0, "LetterA "}, {25, "\xff"}}});
  EXPECT_EQ(line.finish(), R"({"engine":[{"group":0,"name":"LetterA "},{"group":25,"nameHex":"ff"}]})"
                           "\n");
}

TEST(TraceLine, NestsObjectsInArraysInObjects) {
  TraceLine line;
  line.beginObject("record");
  line.beginArray("items");
  for (const int value : {1, 2}) {
    line.beginElement();
    line.addInteger("class", value);
    line.endObject();
  }
  line.endArray();
  line.addInteger("timestamp", 3);
  line.endObject();
  line.addNull("after");
  EXPECT_EQ(line.finish(), R"({"record":{"items":[{"class":1},{"class":2}],"timestamp":3},"after":null})"
                           "\n");
}

TEST(TraceLine, SaysWhatACallReturned) {
  TraceLine line;
  line.addOpened(true);
  EXPECT_EQ(line.finish(), "{\"returned\":\"handle\"}\n");
  line.clear();
  line.addOpened(false);
  EXPECT_EQ(line.finish(), "{\"returned\":null}\n");
  line.clear();
  line.addReturned(-1);
  EXPECT_EQ(line.finish(), "{\"returned\":-1}\n");
}

}  // namespace
}  // namespace senseloom::tool
