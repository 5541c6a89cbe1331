#include <gtest/gtest.h>
#include <senseloom.h>

#include <cstdint>
#include <cstring>

#include "c_client.h"

namespace {

// An integer or a pointer of a list's bytes.
template <class Value>
Value at(const void* bytes, size_t offset) {
  Value value;
  std::memcpy(&value, static_cast<const uint8_t*>(bytes) + offset, sizeof value);
  return value;
}

// Whether the library writes what the header says is seen on the bytes.
TEST(Header, ListIsACountFollowedByEntriesWithoutASentinel) {
  void* const handle = ctx_open_session("STAP");
  ctx_option_t* list = nullptr;
  ASSERT_EQ(ctx_set_option(handle, 0, R"({"classMask": 2, "level": -5})", &list), 0);

  constexpr size_t kPointer = sizeof(void*);
  constexpr size_t kEntry = 8 + kPointer;
  EXPECT_EQ(at<int32_t>(list, 0), 2);
  EXPECT_EQ(at<int32_t>(list, kPointer), 101);
  EXPECT_EQ(at<int32_t>(list, kPointer + 4), 4);
  EXPECT_EQ(at<int32_t>(at<const void*>(list, kPointer + 8), 0), 2);
  EXPECT_EQ(at<int32_t>(list, kPointer + kEntry), 102);
  EXPECT_EQ(at<int32_t>(list, kPointer + kEntry + 4), 4);
  EXPECT_EQ(at<int32_t>(at<const void*>(list, kPointer + kEntry + 8), 0), -5);
  EXPECT_EQ(ctx_option_release(list), 0);
  EXPECT_EQ(ctx_close_session(handle, &list), 0);
}

TEST(Header, NullListIsReleasedWithoutHarm) {
  EXPECT_EQ(ctx_option_release(nullptr), 0);
}

TEST(Header, ServesAClientWrittenInC) {
  EXPECT_EQ(runClientInC(), 0);
}

}  // namespace
