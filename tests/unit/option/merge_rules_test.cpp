#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

#include "option/option_description.h"

namespace senseloom {
namespace {

struct RuleCase {
  Merge rule;
  std::vector<int32_t> values;  // that settings of such keys have
  int32_t outcome;              // of merging them all, in this order
  bool idempotent = true;
};

const std::vector<RuleCase> kRules = {
    {Merge::bitOr, {1, 2, 6, 32}, 39},
    {Merge::bitOr, {-1, 0, 128, 255}, -1},
    {Merge::minimum, {0, 5, -5, -1}, -5},
    {Merge::maximum, {0, 2, 1}, 2},
    {Merge::allOne, {1, 0}, 0},
    {Merge::allOne, {1, 1}, 1},
    {Merge::allOne, {2, 2, -1}, 0, false},  // any mode but 1 counts as 0
    {Merge::anySet, {0, 1}, 1},
    {Merge::anySet, {0, 0}, 0},
    {Merge::keepFirst, {300, 100, 200}, 300},
    {Merge::takeLast, {300, 100, 200}, 200},
};

int32_t mergedInOrder(const RuleCase& one, int32_t start, const std::vector<int32_t>& order) {
  for (const int32_t value : order) start = merged(one.rule, start, value);
  return start;
}

// A negotiation starts from a copy of one session's option and merges those of all sessions into it, that one's
// included.
TEST(MergeRules, NeitherTheOrderNorTheStartMattersUnlessOneSideDecides) {
  for (const RuleCase& one : kRules) {
    std::vector<int32_t> order = one.values;
    std::ranges::sort(order);
    do {
      for (const int32_t start : order) {
        const int32_t expected = one.rule == Merge::keepFirst  ? start
                                 : one.rule == Merge::takeLast ? order.back()
                                                               : one.outcome;
        EXPECT_EQ(mergedInOrder(one, start, order), expected) << testing::PrintToString(order) << " from " << start;
      }
    } while (std::ranges::next_permutation(order).found);
    EXPECT_EQ(mergedInOrder(one, one.values.front(), one.values), one.outcome);
  }
}

TEST(MergeRules, AreIdempotentForTheValuesTheyAreMeantFor) {
  for (const RuleCase& one : kRules) {
    const bool idempotent =
        std::ranges::all_of(one.values, [&](int32_t value) { return merged(one.rule, value, value) == value; });
    EXPECT_EQ(idempotent, one.idempotent) << testing::PrintToString(one.values);
  }
}

}  // namespace
}  // namespace senseloom
