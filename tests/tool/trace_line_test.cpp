#include "trace_line.h"

#include <gtest/gtest.h>

#include <array>
#include <cstdint>
#include <string_view>

#include "senseloom.h"

namespace senseloom::trace {
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

TEST(TraceLine, EscapesWhatAStringCanNotHold) {
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
  int32_t value = -2;
  std::array<uint8_t, 3> bytes{1, 2, 0xfe};
  // Room for a list of two.
  alignas(ctx_option_t) std::array<uint8_t, sizeof(ctx_option_t) + 2 * sizeof(ctx_property_t)> storage{};
  auto* list = new (storage.data()) ctx_option_t;
  TraceLine line;
  list->count = 0;
  line.addProperties("properties", *list);
  EXPECT_EQ(line.finish(), "{\"properties\":[]}\n");

  list->count = 2;
  list->properties[0] = {122, sizeof value, &value};
  list->properties[1] = {123, sizeof bytes, bytes.data()};
  line.clear();
  line.addProperties("properties", *list);
  EXPECT_EQ(line.finish(),
            R"({"properties":[{"id":122,"size":4,"value":"feffffff"},{"id":123,"size":3,"value":"0102fe"}]})"
            "\n");
}

}  // namespace
}  // namespace senseloom::trace
