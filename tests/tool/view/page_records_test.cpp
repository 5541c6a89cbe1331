#include "view/page_records.h"

#include <gtest/gtest.h>

#include <array>
#include <initializer_list>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "view/levels.h"
#include "view/packed_numbers.h"

namespace senseloom::tool {
namespace {

std::string asText(const PackedNumbers& stream) {
  return {stream.bytes().begin(), stream.bytes().end()};
}

TEST(PackedNumbers, TakesSevenBitsAByte) {
  PackedNumbers stream;
  stream.add(0);
  stream.add(127);
  stream.add(300);  // 2 * 128 + 44
  EXPECT_EQ(asText(stream), std::string("\x00\x7F\xAC\x02", 4));
}

TEST(PackedNumbers, TakesNegativeNumbers) {
  PackedNumbers stream;
  stream.addSigned(-1);
  stream.addSigned(1);
  stream.addSigned(INT64_MIN);  // the greatest number in 64 bits
  EXPECT_EQ(asText(stream), "\x01\x02\xFF\xFF\xFF\xFF\xFF\xFF\xFF\xFF\xFF\x01");
}

TEST(Base64, IsAsItsStandardShows) {
  const auto of = [](std::string_view text) {
    return base64({reinterpret_cast<const uint8_t*>(text.data()), text.size()});
  };
  EXPECT_EQ(of(""), "");
  EXPECT_EQ(of("f"), "Zg==");
  EXPECT_EQ(of("ab"), "YWI=");
  EXPECT_EQ(of("foobar"), "Zm9vYmFy");
}

constexpr uint32_t kGreatest = 8;
constexpr uint32_t kLast = 9;

TEST(Levels, FewRecordsHaveNone) {
  Levels levels(kGreatest, kLast);
  for (int i = 0; i < 64; ++i) levels.endRecord(1);
  levels.end();
  EXPECT_TRUE(levels.texts().empty());
}

TEST(Levels, SumUp64RecordsEach) {
  Levels levels(kGreatest, kLast);
  for (uint32_t i = 0; i < 65; ++i) {
    levels.count(0, 3, 1);
    levels.count(0, kGreatest, i % 7);
    levels.count(0, kLast, i);
    levels.endRecord(i == 0 ? 0 : 2);
  }
  levels.end();
  PackedNumbers expected;
  // 64 records with 6 at most, and 63 at last; then one record, 64 times 2 later.
  for (const int64_t step : {0, 128}) {
    expected.addSigned(step);
    const std::array<uint64_t, 3> values =
        step == 0 ? std::array<uint64_t, 3>{64, 6, 63} : std::array<uint64_t, 3>{1, 1, 64};
    expected.add(3);
    for (const auto& [key, value] : {std::pair{3U, values[0]}, {kGreatest, values[1]}, {kLast, values[2]}}) {
      expected.add(0);
      expected.add(key);
      expected.add(value);
    }
  }
  EXPECT_EQ(levels.texts(), std::vector<std::string>{base64(expected.bytes())});
}

TEST(Levels, SumUp64SumsEach) {
  Levels levels(kGreatest, kLast);
  for (int i = 0; i < 64 * 64 + 1; ++i) {
    levels.count(1, 0, 2);
    levels.endRecord(1);
  }
  levels.end();
  ASSERT_EQ(levels.texts().size(), 2U);
  PackedNumbers expected;
  for (const auto& [step, value] : {std::pair<int64_t, uint64_t>{1, 2 * 4096}, {4096, 2}}) {
    expected.addSigned(step);
    for (const uint64_t number : {uint64_t{1}, uint64_t{1}, uint64_t{0}, value}) expected.add(number);
  }
  EXPECT_EQ(levels.texts()[1], base64(expected.bytes()));
}

PageRecord recordOf(uint64_t timestamp, const std::string& verdict) {
  return {.line = 1,
          .sensor = 0,
          .lane = 0,
          .timestamp = timestamp,
          .shown = {},
          .receptions = {{.client = 0, .lane = 1, .verdict = {0, verdict}, .result = std::nullopt}}};
}

TEST(PageRecords, VerdictsShareTheirWords) {
  PageRecords records;
  records.add(recordOf(1, "batch filling: 1 of 8 items"));
  records.add(recordOf(2, "batch filling: 2 of 8 items"));
  records.add(recordOf(3, "class not wanted: bits 2, mask -1"));
  records.end();
  const Json summary(json_object());
  records.describe(summary);
  const Json expected(json_pack("[s,s]", "batch filling: # of # items", "class not wanted: bits #, mask -#"));
  EXPECT_TRUE(json_equal(json_object_get(summary.get(), "wordings"), expected.get()));
}

TEST(PageRecords, TimesThatDoNotRiseAreNoTimes) {
  const auto isTime = [](std::initializer_list<uint64_t> timestamps) {
    PageRecords records;
    for (const uint64_t timestamp : timestamps) records.add(recordOf(timestamp, "delivered"));
    records.end();
    const Json summary(json_object());
    records.describe(summary);
    return json_is_true(json_object_get(summary.get(), "isTime"));
  };
  EXPECT_TRUE(isTime({5, 5, 6}));
  EXPECT_FALSE(isTime({5, 5}));
  EXPECT_FALSE(isTime({5, 6, 4}));
  EXPECT_FALSE(isTime({}));
}

}  // namespace
}  // namespace senseloom::tool
