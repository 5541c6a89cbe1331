#include "option/described_option.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include "option/option_kinds.h"
#include "option_test_support.h"

namespace senseloom {
namespace {

enum class Decides { everyone, first, last };

// A key whose settings merge by a rule.
struct MergedKey {
  const char* title;
  Merge rule;
  std::unique_ptr<DescribedOption> (*make)();
  size_t key;
  std::vector<int32_t> values;  // that are set as they are
  Decides decides;
  bool idempotent = true;
};

template <class Kind>
std::unique_ptr<DescribedOption> make() {
  return std::make_unique<Kind>();
}

const std::vector<MergedKey> kMergedKeys = {
    {"Mask", Merge::bitOr, make<OptionGestureFlick>, 0, {1, 2, 6, 63}, Decides::everyone},
    {"MaskOfAll", Merge::bitOr, make<OptionActivity>, 3, {-1, 0, 128, 255}, Decides::everyone},
    {"Smallest", Merge::minimum, make<OptionGestureFlick>, 1, {-5, -1, 0, 5}, Decides::everyone},
    {"Greatest", Merge::maximum, make<OptionShaking>, 0, {0, 1, 2}, Decides::everyone},
    {"AllOneOfFlags", Merge::allOne, make<OptionStepCount>, 0, {0, 1}, Decides::everyone},
    {"AllOneOfAnyValues", Merge::allOne, make<OptionActivity>, 0, {-1, 0, 1, 2}, Decides::everyone, false},
    {"AnySet", Merge::anySet, make<OptionActivity>, 6, {0, 1}, Decides::everyone},
    {"First", Merge::keepFirst, make<OptionPDR>, 0, {100, 200, 300}, Decides::first},
    {"Last", Merge::takeLast, make<OptionAudioClassification>, 0, {-1, 0, 7, 5000}, Decides::last},
};

std::unique_ptr<DescribedOption> option(const MergedKey& merged, int32_t value) {
  auto made = merged.make();
  const std::string text =
      std::string("{\"") + made->description().keys[merged.key].name + "\":" + std::to_string(value) + "}";
  EXPECT_EQ(made->parse(text.c_str()), 0);
  EXPECT_EQ(made->setting(merged.key), value);
  return made;
}

// The first option with the second merged in.
std::unique_ptr<DescribedOption> operator+(std::unique_ptr<DescribedOption> mine,
                                           const std::unique_ptr<DescribedOption>& other) {
  mine->merge(*other);
  return mine;
}

// Runs `check(merged, option, setting)` for each key, where option(value) makes an option and setting(option) reads it.
template <class Check>
void forEachRule(Check check) {
  for (const MergedKey& merged : kMergedKeys) {
    SCOPED_TRACE(merged.title);
    check(
        merged, [&](int32_t value) { return option(merged, value); },
        [&](const auto& from) { return from->setting(merged.key); });
  }
}

TEST(MergeRules, EachIsTheRuleOfAKeyHere) {
  std::set<Merge> tested;
  forEachRule([&](const MergedKey& merged, auto, auto) {
    EXPECT_EQ(merged.make()->description().keys[merged.key].merge, merged.rule);
    tested.insert(merged.rule);
  });
  EXPECT_EQ(tested, (std::set{Merge::bitOr, Merge::minimum, Merge::maximum, Merge::allOne, Merge::anySet,
                              Merge::keepFirst, Merge::takeLast}));
}

TEST(MergeRules, AreCommutativeUnlessOneSideDecides) {
  forEachRule([](const MergedKey& merged, auto with, auto setting) {
    for (const int32_t a : merged.values) {
      for (const int32_t b : merged.values) {
        const int32_t ab = setting(with(a) + with(b));
        const int32_t expected = merged.decides == Decides::first  ? a
                                 : merged.decides == Decides::last ? b
                                                                   : setting(with(b) + with(a));
        EXPECT_EQ(ab, expected) << a << ' ' << b;
      }
    }
  });
}

TEST(MergeRules, AreAssociative) {
  forEachRule([](const MergedKey& merged, auto with, auto setting) {
    for (const int32_t a : merged.values) {
      for (const int32_t b : merged.values) {
        for (const int32_t c : merged.values) {
          EXPECT_EQ(setting((with(a) + with(b)) + with(c)), setting(with(a) + (with(b) + with(c))))
              << a << ' ' << b << ' ' << c;
        }
      }
    }
  });
}

TEST(MergeRules, AreIdempotentForTheValuesTheyAreMeantFor) {
  forEachRule([](const MergedKey& merged, auto with, auto setting) {
    const bool idempotent =
        std::ranges::all_of(merged.values, [&](int32_t value) { return setting(with(value) + with(value)) == value; });
    EXPECT_EQ(idempotent, merged.idempotent);
  });
}

// A sensor copies the option of one session and merges those of all into the copy, that one's included.
TEST(MergeRules, NeitherTheOrderNorTheStartOfANegotiationMattersUnlessOneSideDecides) {
  forEachRule([](const MergedKey& merged, auto with, auto) {
    std::vector<int32_t> order = merged.values;
    std::ranges::sort(order);
    std::optional<int32_t> before;
    do {
      for (const int32_t start : order) {
        const auto copy = with(start)->clone();
        for (const int32_t value : order) copy->merge(*with(value));
        const int32_t outcome = static_cast<const DescribedOption&>(*copy).setting(merged.key);
        const int32_t expected = merged.decides == Decides::first  ? start
                                 : merged.decides == Decides::last ? order.back()
                                                                   : before.value_or(outcome);
        EXPECT_EQ(outcome, expected) << testing::PrintToString(order) << " from " << start;
        before = outcome;
      }
    } while (std::ranges::next_permutation(order).found);
  });
}

// A kind that is data alone.
inline constexpr OptionKey kPlainKeys[] = {{.name = "plain", .defaultValue = 5}};
inline constexpr OptionProperty kPlainProperties[] = {{7, "computed", OptionProperty::kComputed}, {8, "plain", 0}};
inline constexpr OptionDescription kPlain{
    .sensor = "PLAIN", .title = "plain", .keys = kPlainKeys, .properties = kPlainProperties, .logTag = kLogTag};
class OptionPlain final : public OptionKind<OptionPlain, kPlain> {};

TEST(DescribedOption, ComputedPropertyIs0UnlessTheKindComputesIt) {
  OptionPlain option;
  EXPECT_EQ(entriesOf(listOf(option)), (std::vector<Property>{{7, 4, 0}, {8, 4, 5}}));
}

}  // namespace
}  // namespace senseloom
