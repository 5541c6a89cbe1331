#include <gtest/gtest.h>
#include <senseloom.h>
#include <sys/mman.h>
#include <unistd.h>

#include <cstdint>
#include <cstring>
#include <string>

#include "platform.h"

// Calls with arguments that only a program can make.

// AddressSanitizer ends the process for a block that cannot be, unless it is told not to.
extern "C" const char* __asan_default_options() {
  return "allocator_may_return_null=1";
}

namespace {

int calls_of_log = 0;

bool madeSensors() {
  return getSensor("PHYAC") != nullptr;
}

// Some of the arguments are wrong, as the bits of the number say.
TEST(Arguments, OfADispatchThatAreWrongInAnyCombinationAreRefusedBeforeTheSensorsAreMade) {
  char data[32] = {};
  void* const untouched = &data;
  for (int wrong = 1; wrong < 32; ++wrong) {
    void* out = untouched;
    int length = 77;
    const int result = ctx_dispatch_data((wrong & 1) != 0 ? nullptr : data, (wrong & 2) != 0 ? nullptr : data,
                                         (wrong & 4) != 0 ? -1 : 32, (wrong & 8) != 0 ? nullptr : &out,
                                         (wrong & 16) != 0 ? nullptr : &length);
    EXPECT_EQ(result, -1) << wrong;
    EXPECT_EQ(out, untouched) << wrong;
    EXPECT_EQ(length, 77) << wrong;
  }
  EXPECT_FALSE(madeSensors());
}

TEST(Arguments, OfAClosingThatAreWrongAreRefusedBeforeAnythingIsStoredOrMade) {
  static ctx_option_t somewhere;
  ctx_option_t* list = &somewhere;
  EXPECT_EQ(ctx_close_session(nullptr, &list), -1);
  EXPECT_EQ(ctx_close_session(nullptr, nullptr), -1);
  EXPECT_EQ(ctx_close_session(&list, nullptr), -1);
  EXPECT_EQ(list, &somewhere);
  EXPECT_FALSE(madeSensors());
  EXPECT_EQ(ctx_close_session(&somewhere, &list), -1);
  EXPECT_EQ(list, nullptr);
  EXPECT_TRUE(madeSensors());
}

TEST(Arguments, OfAnOptionThatAreWrongInAnyCombinationAreRefusedBeforeAnythingIsStoredOrMade) {
  char handle[64] = {};
  static ctx_option_t somewhere;
  for (int wrong = 1; wrong < 8; ++wrong) {
    ctx_option_t* list = &somewhere;
    EXPECT_EQ(ctx_set_option((wrong & 1) != 0 ? nullptr : handle, 0, (wrong & 2) != 0 ? nullptr : "not JSON",
                             (wrong & 4) != 0 ? nullptr : &list),
              -1)
        << wrong;
    EXPECT_EQ(list, &somewhere) << wrong;
  }
  EXPECT_FALSE(madeSensors());
}

TEST(Arguments, StringForAnUnknownHandleIsNotRead) {
  platform::hooks.logged = [](const char*) { ++calls_of_log; };
  char handle[64] = {};
  ctx_option_t* list = nullptr;
  EXPECT_EQ(ctx_set_option(handle, 0, "not JSON", &list), -1);
  EXPECT_EQ(calls_of_log, 0);
  EXPECT_TRUE(madeSensors());
}

TEST(Arguments, SensorNameOfNullStillMakesTheSensors) {
  EXPECT_EQ(ctx_open_session(nullptr), nullptr);
  EXPECT_TRUE(madeSensors());
}

TEST(SensorNames, AreReadUpToTheirNinthCharacter) {
  const auto page = static_cast<size_t>(sysconf(_SC_PAGESIZE));
  auto* const pages =
      static_cast<char*>(mmap(nullptr, 2 * page, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0));
  ASSERT_NE(static_cast<void*>(pages), MAP_FAILED);
  ASSERT_EQ(mprotect(pages + page, page, PROT_NONE), 0);
  char* const name = pages + page - 9;

  platform::hooks.logged = [](const char*) { ++calls_of_log; };
  std::memcpy(name, "LPE_PLPE_", 9);
  EXPECT_EQ(ctx_open_session(name), nullptr);
  EXPECT_EQ(calls_of_log, 0) << "the audio device was not asked for";
  std::memcpy(name, "LPE_P\0LPE", 9);
  void* const handle = ctx_open_session(name);
  EXPECT_NE(handle, nullptr);
  EXPECT_GT(calls_of_log, 0);
  ctx_option_t* list = nullptr;
  EXPECT_EQ(ctx_close_session(handle, &list), 0);
  munmap(pages, 2 * page);
}

// --- results as records

struct Dispatched {
  int result;
  std::string bytes;
  void* out;
};

Dispatched dispatch(void* handle, void* record, size_t size) {
  Dispatched dispatched{0, {}, nullptr};
  int length = 0;
  dispatched.result = ctx_dispatch_data(handle, record, static_cast<int>(size), &dispatched.out, &length);
  if (dispatched.result == 1) dispatched.bytes.assign(static_cast<char*>(dispatched.out), static_cast<size_t>(length));
  return dispatched;
}

struct Feedback {
  const char* sensor;
  const char* option;
  std::string record;
};

TEST(Results, CanBeTheNextRecordOfTheirSession) {
  const std::string header(8, 'T');
  const Feedback cases[] = {
      {"PHYAC", "{}", header + std::string("\x01\0\x51\0", 4)},
      {"PHYAC", R"({"summary":0,"logN":1})", header + std::string("\x02\0\x51\0\x62\0", 6)},
      {"PDR", R"({"N":1})", header + std::string("\x02\0", 2) + std::string(28, 'a') + std::string(28, 'b')},
      {"GSPX", "{}", header + std::string("\0\0\x0C\0", 4) + std::string(12, 's')},
      {"STAP", "{}", header + std::string("\x01\0", 2)},
  };
  for (auto [sensor, option, record] : cases) {
    SCOPED_TRACE(sensor);
    void* const handle = ctx_open_session(sensor);
    ctx_option_t* list = nullptr;
    ASSERT_EQ(ctx_set_option(handle, 0, option, &list), 0);
    ctx_option_release(list);
    const Dispatched first = dispatch(handle, record.data(), record.size());
    ASSERT_EQ(first.result, 1);
    for (int round = 0; round < 3; ++round) {
      const Dispatched again = dispatch(handle, first.out, first.bytes.size());
      EXPECT_EQ(again.result, 1);
      EXPECT_EQ(again.out, first.out);
      EXPECT_EQ(again.bytes, first.bytes);
    }
    ASSERT_EQ(ctx_close_session(handle, &list), 0);
  }
}

// --- the growable array

// 2^30 bytes an element and 2^30 elements: the product is 0 in 32 bits, and beyond what 64 bits address.
TEST(GrowableArray, DoesNotGrowBeyondTheAddressSpace) {
  char memory[1];
  varray_t array{.count = 1 << 29, .capacity = 1 << 29, .elemSize = 1 << 30, .data = memory};
  EXPECT_EQ(va_new(&array), nullptr);
  EXPECT_EQ(array.count, 1 << 29);
  EXPECT_EQ(array.capacity, 1 << 29);
  EXPECT_EQ(array.data, memory);
}

#if UINTPTR_MAX == UINT32_MAX  // 64 bits have room for 16 of the largest elements

// 16 elements of 2^28 bytes: 0 in 32 bits.
TEST(GrowableArray, OfTooLargeElementsHasNoStorage) {
  varray_t array{};
  EXPECT_EQ(_va_init(&array, 1 << 28), nullptr);
  EXPECT_EQ(array.data, nullptr);
  EXPECT_EQ(va_new(&array), nullptr);
}

#endif

}  // namespace
