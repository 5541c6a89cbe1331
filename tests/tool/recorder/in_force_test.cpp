#include "recorder/in_force.h"

#include <gtest/gtest.h>

#include <string>

namespace senseloom::trace {
namespace {

std::string toldBy(const InForce& inForce) {
  std::string lines;
  inForce.tell([&lines](std::string_view line, bool /*isCall*/) { lines += line; },
               [](uint32_t session) { return session == 9; });
  return lines;
}

TEST(InForceTest, TellsOpensAndOptionsInTheirOrder) {
  InForce inForce;
  inForce.opened(1, "PHYAC");
  inForce.optionSet(1, "A", true);
  inForce.opened(9, "STAP");
  inForce.optionSet(9, "B", false);
  EXPECT_EQ(toldBy(inForce), R"({"call":"open","session":"s1","sensor":"PHYAC"}
{"call":"set_option","session":"s1","option":"A"}
{"call":"open","session":"s9","sensor":"STAP","resumed":1}
{"call":"set_option","session":"s9","option":"B","refused":1}
)");
}

// The last to set a field decides it, so of equal strings only the last matters.
TEST(InForceTest, KeepsOfEqualOptionsTheLast) {
  InForce inForce;
  inForce.opened(1, "STAP");
  for (const char* option : {"A", "B", "A"}) inForce.optionSet(1, option, true);
  inForce.optionSet(1, "B", false);
  EXPECT_EQ(toldBy(inForce), R"({"call":"open","session":"s1","sensor":"STAP"}
{"call":"set_option","session":"s1","option":"B"}
{"call":"set_option","session":"s1","option":"A"}
{"call":"set_option","session":"s1","option":"B","refused":1}
)");
}

TEST(InForceTest, DoesNotGrowWithOptionsThatNeverEnd) {
  InForce inForce;
  inForce.opened(1, "STAP");
  for (int i = 0; i < 10000; ++i) inForce.optionSet(1, std::to_string(i).c_str(), true);
  EXPECT_LT(toldBy(inForce).size(), 256 * 80U);
  EXPECT_NE(toldBy(inForce).find("\"9999\""), std::string::npos);
}

// A session that was opened after the last option takes part in the negotiation that another's closing brings.
TEST(InForceTest, HasTheSessionsThatRemainNegotiate) {
  InForce inForce;
  inForce.opened(1, "PHYAC");
  inForce.opened(2, "PHYAC");
  inForce.closed(1, true);
  const std::string others = R"({"call":"open","session":"s0","sensor":"PHYAC"}
{"call":"close","session":"s0"}
)";
  const std::string open = R"({"call":"open","session":"s2","sensor":"PHYAC"})"
                           "\n";
  EXPECT_EQ(toldBy(inForce), open + others);
  inForce.optionSet(2, "A", true);
  EXPECT_EQ(toldBy(inForce), open + R"({"call":"set_option","session":"s2","option":"A"})" + "\n");
  inForce.closed(2, false);
  EXPECT_EQ(toldBy(inForce), "");
}

TEST(InForceTest, KeepsAnUninitAsLongAsASessionIsFromBefore) {
  InForce inForce;
  inForce.opened(1, "PHYAC");
  inForce.uninitialised();
  inForce.opened(2, "PHYAC");
  EXPECT_EQ(toldBy(inForce), R"({"call":"open","session":"s1","sensor":"PHYAC"}
{"call":"uninit"}
{"call":"open","session":"s2","sensor":"PHYAC"}
)");
  inForce.closed(1, false);
  EXPECT_EQ(toldBy(inForce), R"({"call":"open","session":"s2","sensor":"PHYAC"})"
                             "\n");
}

TEST(InForceTest, TellsTheLastListOfASensorWithSessions) {
  InForce inForce;
  inForce.opened(1, "PHYAC");
  inForce.listed(1, "first\n");
  inForce.listed(1, "second\n");
  EXPECT_EQ(toldBy(inForce), R"({"call":"open","session":"s1","sensor":"PHYAC"})"
                             "\nsecond\n");
  EXPECT_EQ(inForce.sessionsBeside(1), std::vector<uint32_t>{1});
  inForce.closed(1, false);
  EXPECT_EQ(toldBy(inForce), "");
  EXPECT_EQ(inForce.sensorOf(1), "");
}

}  // namespace
}  // namespace senseloom::trace
