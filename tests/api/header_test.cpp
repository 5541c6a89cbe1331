#include "c_client.h"
#include "client.h"

namespace api {
namespace {

// Whether the library writes what the header says is seen on the bytes.
TEST(Header, ListIsACountFollowedByEntriesWithoutASentinel) {
  void* const handle = ctx_open_session("STAP");
  const auto [result, list] = setAndKeep(handle, R"({"classMask": 2, "level": -5})");
  ASSERT_EQ(result, 0);

  const auto* const bytes = reinterpret_cast<const uint8_t*>(list.get());
  const auto word = [&](size_t offset) {
    int32_t value;
    std::memcpy(&value, bytes + offset, sizeof value);
    return value;
  };
  constexpr size_t kPointer = sizeof(void*);
  constexpr size_t kEntry = 8 + kPointer;
  EXPECT_EQ(word(0), 2);
  EXPECT_EQ(word(kPointer), 101);
  EXPECT_EQ(word(kPointer + 4), 4);
  EXPECT_EQ(word(kPointer + kEntry), 102);
  EXPECT_EQ(word(kPointer + kEntry + 4), 4);
  const auto value = [&](size_t offset) {
    const void* pointer;
    std::memcpy(&pointer, bytes + offset, sizeof pointer);
    int32_t pointedAt;
    std::memcpy(&pointedAt, pointer, sizeof pointedAt);
    return pointedAt;
  };
  EXPECT_EQ(value(kPointer + 8), 2);
  EXPECT_EQ(value(kPointer + kEntry + 8), -5);
  EXPECT_EQ(closeSession(handle), kStopped);
}

TEST(Header, NullListIsReleasedWithoutHarm) {
  EXPECT_EQ(ctx_option_release(nullptr), 0);
}

TEST(Header, ServesAClientWrittenInC) {
  EXPECT_EQ(runClientInC(), 0);
}

}  // namespace
}  // namespace api
