#include "trace/hex.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <vector>

namespace senseloom::tool {
namespace {

using Bytes = std::vector<uint8_t>;

TEST(Hex, ToHexWritesTwoLowercaseDigitsAByteHighNibbleFirst) {
  EXPECT_EQ(toHex(Bytes{0x00, 0x0f, 0xa1, 0xff}), "000fa1ff");
  EXPECT_EQ(toHex({}), "");
}

TEST(Hex, FromHexReadsDigitsInEitherCase) {
  EXPECT_EQ(fromHex("000fA1fF"), (Bytes{0x00, 0x0f, 0xa1, 0xff}));
  EXPECT_EQ(fromHex(""), Bytes{});
}

TEST(Hex, FromHexRefusesWhatIsNotAPairOfDigits) {
  for (const char* text : {"0", "abc", "0g", "g0", " 1", "1 ", "+1", "-1", "0x", "a1 b2"}) {
    EXPECT_EQ(fromHex(text), std::nullopt) << text;
  }
}

}  // namespace
}  // namespace senseloom::tool
