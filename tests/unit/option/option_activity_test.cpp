#include "option/option_activity.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <limits>
#include <string>
#include <vector>

#include "option_test_support.h"

namespace senseloom {
namespace {

using ActivityOption = OptionTest;

std::string spans(int64_t logN, int64_t logM) {
  return "{\"logN\":" + std::to_string(logN) + ",\"logM\":" + std::to_string(logM) + "}";
}

TEST_F(ActivityOption, EmptyObjectRendersSpansOfOne) {
  auto option = parsed<OptionActivity>("{}");
  EXPECT_EQ(option.maxLogN(), 0);
  EXPECT_EQ(entriesOf(listOf(option)), (std::vector<Property>{{41, 4, 0}, {43, 4, 65537}, {44, 4, 1}, {42, 4, -1}}));
}

TEST_F(ActivityOption, RendersTheSpansAsPowersOfTwo) {
  struct Row {
    int64_t logN, logM;
    int32_t spans, decisions;
  };
  const Row rows[] = {
      {0, 0, 65537, 1},            // 2^16 + 2^0
      {3, 5, 524296, 1},           // 2^19 + 2^3; logM is cut to 3
      {4, 1, 1048592, 8},          // 2^20 + 2^4; 16 >> 1
      {8, 0, 16777472, 256},       // 2^24 + 2^8
      {8, 3, 16777472, 32},        //
      {9, 8, 33554688, 1},         // the largest is shown as it was given: 2^25 + 2^8
      {12, 0, 268435712, 256},     // 2^28 + 2^8
      {15, 0, -2147483392, 256},   // 2^31 is the sign
      {16, 0, 256, 256},           // 2^32 is lost
      {31, 0, 256, 256},           // the shift by 31 is shifted out by 16 more
      {32, 0, 65792, 256},         // shifts by 0: 2^16 + 2^8
      {44, 0, 268435712, 256},     // ... by 12
      {-1, 0, 1, 1},               // ... by 31; the smallest is 2^0
      {-20, 0, 268435457, 1},      // ... by 12
      {2147483647, 0, 256, 256},   // ... by 31
      {-2147483648, 0, 65537, 1},  // ... by 0
      {4294967299, 0, 524296, 8},  // 3 in 32 bits
  };
  for (const auto& [logN, logM, span, decisions] : rows) {
    auto option = parsed<OptionActivity>(spans(logN, logM));
    EXPECT_EQ(option.maxLogN(), static_cast<int32_t>(logN));
    EXPECT_EQ(entriesOf(listOf(option)),
              (std::vector<Property>{{41, 4, 0}, {43, 4, span}, {44, 4, decisions}, {42, 4, -1}}))
        << spans(logN, logM);
  }
}

TEST_F(ActivityOption, MergeFindsTheLargestSpan) {
  struct Row {
    int32_t mine, other, largest, smallest;
  };
  const Row rows[] = {
      {3, 4, 4, 3},
      {4, 3, 4, 3},
      {12, 3, 12, 3},  // the option that the merge starts from brings in its value as
                       // it was given
      {3, 12, 8, 3},   // ... any other as it was clamped
      {12, 12, 12, 8},
      {-5, 0, 0, 0},
      {0, -5, 0, 0},
      {-5, -5, 0, 0},
      {-5, 7, 7, 0},
  };
  for (const auto& [mine, other, largest, smallest] : rows) {
    auto option = parsed<OptionActivity>(spans(mine, 0));
    option.merge(parsed<OptionActivity>(spans(other, 0)));
    EXPECT_EQ(option.maxLogN(), largest) << mine << ' ' << other;
    EXPECT_EQ(option.logN(), smallest) << mine << ' ' << other;
  }
}

TEST_F(ActivityOption, MergeTakesTheOthersSmallestSpanAndNotItsLargest) {
  auto other = parsed<OptionActivity>(spans(1, 0));
  other.merge(parsed<OptionActivity>(spans(7, 0)));
  ASSERT_EQ(other.maxLogN(), 7);
  auto option = parsed<OptionActivity>(spans(3, 0));
  option.merge(other);
  EXPECT_EQ(option.maxLogN(), 3);
  EXPECT_EQ(option.logN(), 1);
}

TEST_F(ActivityOption, MergedListShowsTheLargestAndTheSmallestSpan) {
  auto option = parsed<OptionActivity>(R"({"mode":1,"logN":3,"logM":2,"classMask":1})");
  option.merge(parsed<OptionActivity>(R"({"mode":1,"logN":4,"logM":1,"classMask":4})"));
  EXPECT_EQ(entriesOf(listOf(option)),  // 2^4 * 2^16 + 2^3; 2^3 >> 1
            (std::vector<Property>{{41, 4, 0}, {43, 4, 1048584}, {44, 4, 4}, {42, 4, 5}}));
}

TEST_F(ActivityOption, ModeStaysOneOnlyAmongEqualSpans) {
  struct Row {
    const char* mine;
    const char* other;
    int32_t mode;
  };
  const Row rows[] = {
      {R"({"mode":1,"logN":3})", R"({"mode":1,"logN":3})", 1},
      {R"({"mode":1,"logN":3})", R"({"mode":1,"logN":4})", 0},
      {R"({"mode":1,"logN":4})", R"({"mode":1,"logN":3})", 0},
      {R"({"mode":1,"logN":3})", R"({"mode":0,"logN":3})", 0},
      {R"({"mode":0,"logN":3})", R"({"mode":1,"logN":3})", 0},
      {R"({"mode":2,"logN":3})", R"({"mode":2,"logN":3})", 0},
      {R"({"mode":-1,"logN":3})", R"({"mode":1,"logN":3})", 0},
      {R"({"mode":1,"logN":8})", R"({"mode":1,"logN":9})", 1},  // equal once they are clamped
      {R"({"mode":1,"logN":-3})", R"({"mode":1,"logN":0})", 1},
  };
  for (const auto& [mine, other, mode] : rows) {
    auto option = parsed<OptionActivity>(mine);
    option.merge(parsed<OptionActivity>(other));
    EXPECT_EQ(option.mode(), mode) << mine << ' ' << other;
  }
}

TEST_F(ActivityOption, ModeStaysZeroWhenALaterSpanIsEqualAgain) {
  auto option = parsed<OptionActivity>(R"({"mode":1,"logN":3})");
  option.merge(parsed<OptionActivity>(R"({"mode":1,"logN":4})"));
  option.merge(parsed<OptionActivity>(R"({"mode":1,"logN":3})"));
  EXPECT_EQ(option.mode(), 0);
}

TEST_F(ActivityOption, CloneKnowsTheLargestSpanAsItWasGiven) {
  const auto option = parsed<OptionActivity>(spans(12, 0));
  const auto copy = option.clone();
  EXPECT_EQ(static_cast<const OptionActivity&>(*copy).maxLogN(), 12);
}

TEST_F(ActivityOption, UnparsableTextKeepsTheLargestSpan) {
  auto option = parsed<OptionActivity>(spans(12, 0));
  EXPECT_EQ(option.parse("{"), -1);
  EXPECT_EQ(option.parse(nullptr), -1);
  EXPECT_EQ(option.maxLogN(), 12);
}

}  // namespace
}  // namespace senseloom
