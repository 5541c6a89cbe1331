#include "session/session_filters.h"

#include <gtest/gtest.h>

#include <limits>
#include <ostream>
#include <string>

#include "delivery.h"

namespace senseloom {
namespace {

constexpr int32_t kLeast32 = std::numeric_limits<int32_t>::min();

// An option string (null: none was given) and the values that pass and do not pass with it.
struct Wish {
  const char* option;
  std::vector<int32_t> delivered;
  std::vector<int32_t> dropped;
};

struct Kind {
  const char* sensor;
  std::unique_ptr<Session> (*create)();
  size_t valueSize;  // bytes of the value at byte 8; 0: not looked at
  int refusal;       // what text that is no JSON gives
  std::vector<Wish> wishes;
};
void PrintTo(const Kind& kind, std::ostream* out) {
  *out << kind.sensor;
}

template <class SessionKind>
std::unique_ptr<Session> create() {
  return std::make_unique<SessionKind>();
}

// A class number's place in the mask is counted from 1 and modulo 32; a set of classes passes when any of its bits is
// wanted, and a negative 16-bit one has bits 16 to 31.
const Kind kKinds[] = {
    {"STAP",
     create<SessionTapping>,
     2,
     -1,
     {{nullptr, {1, 2, 3, 5, 0x7FFF, -1, -3}, {0, 4, 0x7FFC, -4, -32768}},
      {R"({"classMask":1})", {1, 3, 5, -1}, {0, 2, 4, -2}},
      // A bad level empties the mask.
      {R"({"classMask":3,"level":6})", {}, {0, 1, 2, 3, -1}},
      {R"({"classMask":2})", {2, 3, -1, -2}, {0, 1, 5, 4}}}},
    {"GSFLK",
     create<SessionGestureFlick>,
     2,
     -1,
     {{nullptr, {1, 2, 3, 4, 5, 6, 33, 38, -31, -26, 32737}, {0, 7, 32, 39, -1, -25, 32767, -32768}},
      {R"({"classMask":1})", {1, 33, -31}, {0, 2, 32, 34, -30}},
      {R"({"classMask":40})", {4, 6, 36, 38, -28}, {0, 1, 2, 3, 5, 7, 35}}}},
    {"SHAKI", create<SessionShaking>, 0, -1, {{nullptr, {0, 1, -1}, {}}, {R"({"sensitivity":0})", {0, 1, -1}, {}}}},
    {"ISACT",
     create<SessionInstantActivity>,
     4,
     0,
     {{nullptr,
       {1, 2, 3, 4, 33, 36, 65537, -31, kLeast32 + 1, kLeast32 + 4},
       {0, 5, 32, 37, 65536, -1, kLeast32, kLeast32 + 5, std::numeric_limits<int32_t>::max()}},
      {R"({"classMask":8})", {4, 36, -28}, {0, 1, 2, 3, 5}}}},
    // Without an option string no class is wanted.
    {"DTWGS",
     create<SessionDTWGS>,
     2,
     -1,
     {{nullptr, {}, {0, 1, 2, 3, -1}},
      {R"({"mode":4,"classMask":1})", {1, 3, -1}, {0, 2, 4, -2, -32768}},
      {R"({"mode":4,"classMask":3})", {1, 2, 3, 6}, {0, 4}},
      // The mask is not checked while enrolling.
      {R"({"mode":1,"classMask":65536})", {-1, -32768}, {0, 1, 0x7FFF}},
      {R"({"mode":1,"classMask":-2147483648})", {-1, -32768}, {0, 1, 0x7FFF}}}},
    {"GSETH",
     create<SessionGestureEartouch>,
     2,
     -1,
     {{nullptr, {1, 2, 33, 34, -31}, {0, 3, 32, 35, -1, -32768}}, {R"({"classMask":2})", {2, 34}, {0, 1, 3, 33}}}},
    {"LPE_P",
     create<SessionAudioClassification>,
     0,
     -1,
     {{nullptr, {0, 1, -1}, {}}, {R"({"interval":1})", {0, 1, -1}, {}}}},
    {"LIFT", create<SessionLift>, 0, -1, {{nullptr, {0, 1, -1}, {}}, {R"({"classMask":1})", {0, 1, -1}, {}}}},
};

class Filter : public testing::TestWithParam<Kind> {
 protected:
  // Whether a record passes: untouched, and as it is.
  static bool passes(Session& session, Bytes record) {
    const Bytes before = record;
    const Delivery delivery(session, record);
    EXPECT_EQ(record, before);
    if (delivery.result == 0) return false;
    EXPECT_EQ(delivery.result, 1);
    EXPECT_EQ(delivery.out, record.data());
    EXPECT_EQ(delivery.outLen, static_cast<int>(record.size()));
    return true;
  }

  // The value in as many bytes as the kind looks at, and nothing behind it.
  static Bytes recordOf(int32_t value) {
    constexpr uint64_t kTimestamp = 0x1122334455667788;
    return GetParam().valueSize == 4 ? bytesOf(kTimestamp, value) : bytesOf(kTimestamp, static_cast<int16_t>(value));
  }

  const std::unique_ptr<Session> session = GetParam().create();
};

TEST_P(Filter, HasItsSensorsName) {
  EXPECT_STREQ(session->name, GetParam().sensor);
}

TEST_P(Filter, DeliversWhatItsOwnOptionWants) {
  for (const Wish& wish : GetParam().wishes) {
    const auto wishing = GetParam().create();
    SCOPED_TRACE(wish.option != nullptr ? wish.option : "default");
    if (wish.option != nullptr) {
      ASSERT_EQ(wishing->parseOption(wish.option), 0);
    }
    for (const int32_t value : wish.delivered) EXPECT_TRUE(passes(*wishing, recordOf(value))) << value;
    for (const int32_t value : wish.dropped) EXPECT_FALSE(passes(*wishing, recordOf(value))) << value;
  }
}

TEST_P(Filter, LooksAtNothingBehindTheValue) {
  const Wish& wish = GetParam().wishes.back();
  if (wish.option != nullptr) session->parseOption(wish.option);
  for (const bool delivered : {true, false}) {
    for (const int32_t value : delivered ? wish.delivered : wish.dropped) {
      Bytes record = recordOf(value);
      record.resize(100, 0xFF);
      EXPECT_EQ(passes(*session, record), delivered) << value;
    }
  }
}

TEST_P(Filter, ShortRecordsPassOnlyWhereNoValueIsLookedAt) {
  const size_t needed = GetParam().valueSize == 0 ? 0 : 8 + GetParam().valueSize;
  const Wish& wish = GetParam().wishes.back();
  if (wish.option != nullptr) session->parseOption(wish.option);
  const Bytes whole = recordOf(wish.delivered.front());
  for (size_t len = 0; len <= whole.size(); ++len) EXPECT_EQ(passes(*session, cut(whole, len)), len >= needed) << len;
}

TEST_P(Filter, UnreadableStringChangesNothing) {
  const Wish& wish = GetParam().wishes.back();
  if (wish.option != nullptr) session->parseOption(wish.option);
  for (const char* text : {"no JSON", "", static_cast<const char*>(nullptr)}) {
    EXPECT_EQ(session->parseOption(text), GetParam().refusal) << (text != nullptr ? text : "null");
  }
  for (const int32_t value : wish.delivered) EXPECT_TRUE(passes(*session, recordOf(value))) << value;
  for (const int32_t value : wish.dropped) EXPECT_FALSE(passes(*session, recordOf(value))) << value;
}

TEST_P(Filter, HasNothingToBuild) {
  EXPECT_EQ(session->buildProc(), 0);
  const Wish& wish = GetParam().wishes.front();
  for (const int32_t value : wish.delivered) EXPECT_TRUE(passes(*session, recordOf(value))) << value;
  for (const int32_t value : wish.dropped) EXPECT_FALSE(passes(*session, recordOf(value))) << value;
}

INSTANTIATE_TEST_SUITE_P(Kinds, Filter, testing::ValuesIn(kKinds),
                         [](const auto& tested) { return std::string(tested.param.sensor); });

}  // namespace
}  // namespace senseloom
