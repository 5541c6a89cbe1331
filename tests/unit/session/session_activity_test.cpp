#include "session/session_activity.h"

#include <gtest/gtest.h>

#include "bytes_of.h"
#include "registry/registry.h"

namespace senseloom {
namespace {

TEST(ActivityCallbacks, EqualityIsOfClassIds) {
  struct {
    uint16_t a;
    uint16_t b;
    bool equal;
  } const cases[] = {{0x0051, 0x0051, true},  {0x0051, 0xFFF1, true}, {0x0051, 0x0052, false},
                     {0x000F, 0x0007, false}, {0x0000, 0x8000, true}, {0x0008, 0x0000, false}};
  for (const auto& [a, b, equal] : cases) EXPECT_EQ(_activity_equal_func(&a, &b), equal) << a << ' ' << b;
  EXPECT_TRUE(_activity_equal_func(nullptr, nullptr));
  EXPECT_FALSE(_activity_equal_func(&cases[0].a, nullptr));
  EXPECT_FALSE(_activity_equal_func(nullptr, &cases[0].a));
}

TEST(ActivityCallbacks, MaskClearsClassesWhoseBitIsNotSet) {
  for (const int mask : {0, 1, 0x06, 0xFF, 0x8000, 0x7FFF, -1}) {
    for (uint16_t id = 0; id < 16; ++id) {
      auto item = static_cast<uint16_t>(0xABC0 | id);
      _activity_mask_func(&item, mask);
      EXPECT_EQ(item, (mask >> id & 1) != 0 ? 0xABC0 | id : 0xABC0) << mask << ' ' << id;
    }
  }
  _activity_mask_func(nullptr, 0);
}

// Needs a fresh process, in which no sensor was ever made.
TEST(ActivityAlone, CannotBuildWithoutItsSensor) {
  SessionActivity session;
  EXPECT_EQ(session.buildProc(), -1);
}

// A session alone, on a sensor that nothing was negotiated on.
class Activity : public testing::Test {
 protected:
  Activity() { _init_senseloom(); }
  ~Activity() override { deleteSensors(); }

  static int deliver(Session& session, Bytes record, Bytes* result = nullptr) {
    void* out = nullptr;
    int length = 0;
    const int returned = session.postProcess(record.data(), static_cast<int>(record.size()), &out, &length);
    const auto* bytes = static_cast<const uint8_t*>(out);
    if (result != nullptr && out != nullptr) result->assign(bytes, bytes + length);
    return returned;
  }
};

TEST_F(Activity, CannotBuildBeforeTheFirstMergeAndPassesRecordsOn) {
  SessionActivity session;
  const Bytes record = bytesOf(uint64_t{1}, int16_t{2}, uint16_t{0x0011}, uint16_t{0x0022});
  EXPECT_EQ(session.buildProc(), -1);
  Bytes result;
  EXPECT_EQ(deliver(session, record, &result), 1);
  EXPECT_EQ(result, record);
}

TEST_F(Activity, RefusesBadArgumentsItself) {
  SessionActivity session;
  uint8_t record[12] = {};
  void* out = nullptr;
  int length = 0;
  EXPECT_EQ(session.postProcess(record, 12, nullptr, &length), -1);
  EXPECT_EQ(session.postProcess(nullptr, 12, &out, &length), -1);
  EXPECT_EQ(session.postProcess(record, 12, &out, nullptr), -1);
  EXPECT_EQ(session.postProcess(record, -1, &out, &length), -1);
  EXPECT_EQ(out, nullptr);
  EXPECT_EQ(length, 0);
}

}  // namespace
}  // namespace senseloom
