#include <gtest/gtest.h>
#include <senseloom.h>

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <vector>

#include "allocations.h"

#ifdef __has_feature
#define SENSELOOM_HAS_ASAN __has_feature(address_sanitizer)
#elif defined(__SANITIZE_ADDRESS__)
#define SENSELOOM_HAS_ASAN 1
#else
#define SENSELOOM_HAS_ASAN 0
#endif

// How the library uses the heap: not at all for a record, and without harm when memory runs out.
namespace {

using api::allocations;

// Counts a block that is asked for. False when it is the one to fail.
bool askForBlock() {
  if (!allocations.counted) return true;
  return allocations.made++ != allocations.failing;
}
void gotBlock(const volatile void* block) {
  if (allocations.counted && block != nullptr) ++allocations.live;
}
void releasingBlock(const volatile void* block) {
  if (allocations.counted && block != nullptr) --allocations.live;
}

}  // namespace

#if SENSELOOM_HAS_ASAN
// AddressSanitizer has a heap of its own, which tells of every call but lets none fail. g++ comes without the header.
extern "C" int __sanitizer_install_malloc_and_free_hooks(void (*)(const volatile void*, size_t),
                                                         void (*)(const volatile void*));

namespace {

[[maybe_unused]] const int kHooksInstalled = __sanitizer_install_malloc_and_free_hooks(
    [](const volatile void* block, size_t) {
      askForBlock();
      gotBlock(block);
    },
    releasingBlock);

}  // namespace
#else
extern "C" {
void* __libc_malloc(size_t);
void* __libc_calloc(size_t, size_t);
void* __libc_realloc(void*, size_t);
void __libc_free(void*);

void* malloc(size_t size) noexcept {
  void* const block = askForBlock() ? __libc_malloc(size) : nullptr;
  gotBlock(block);
  return block;
}
void* calloc(size_t count, size_t size) noexcept {
  void* const block = askForBlock() ? __libc_calloc(count, size) : nullptr;
  gotBlock(block);
  return block;
}
void* realloc(void* old, size_t size) noexcept {
  if (!askForBlock()) return nullptr;
  releasingBlock(old);
  void* const block = __libc_realloc(old, size);
  gotBlock(block);
  return block;
}
void free(void* block) noexcept {
  releasingBlock(block);
  __libc_free(block);
}
}
#endif

namespace {

// Makes a call with its heap calls counted; the block `failing` of it, from 0, fails.
template <class Call>
auto counted(Call call, int failing = -1) {
  allocations.made = 0;
  allocations.failing = failing;
  allocations.counted = true;
  const auto result = call();
  allocations.counted = false;
  return result;
}

void* open(const char* sensor, int failing = -1) {
  return counted([&] { return ctx_open_session(sensor); }, failing);
}
int setOption(void* handle, const char* text, ctx_option_t** list, int failing = -1) {
  return counted([&] { return ctx_set_option(handle, 0, text, list); }, failing);
}
int close(void* handle, ctx_option_t** list, int failing = -1) {
  return counted([&] { return ctx_close_session(handle, list); }, failing);
}
void release(ctx_option_t* list) {
  counted([&] { return ctx_option_release(list); });
}
void tearDown() {
  counted([] {
    ctx_uninit();
    return 0;
  });
}

void set(void* handle, const char* text) {
  ctx_option_t* list = nullptr;
  EXPECT_EQ(setOption(handle, text, &list), 0);
  release(list);
}
void closeAll(std::initializer_list<void*> handles) {
  for (void* handle : handles) {
    ctx_option_t* list = nullptr;
    EXPECT_GE(close(handle, &list), 0);
    release(list);
  }
}

// Dispatches a record that holds just this value at byte 8, and its result.
int dispatch(void* handle, int16_t value, uint32_t timestamp = 1) {
  uint8_t record[64] = {};
  std::memcpy(record, &timestamp, sizeof timestamp);
  std::memcpy(record + 8, &value, sizeof value);
  void* out = nullptr;
  int length = 0;
  return ctx_dispatch_data(handle, record, sizeof record, &out, &length);
}

struct Client {
  const char* sensor;
  const char* option;
};

TEST(Dispatching, AllocatesNothing) {
  const Client clients[] = {
      {"PHYAC", nullptr},
      {"PHYAC", "{}"},
      {"PHYAC", R"({"logN": 3, "mode": 1, "weightVar": 2, "classMask": 7})"},
      {"PHYAC", R"({"logN": 4, "mode": 1, "summary": 0})"},
      {"STAP", "{}"},
      {"GSFLK", "{}"},
      {"SHAKI", "{}"},
      {"ISACT", "{}"},
      {"SCOUN", R"({"mode": 0})"},
      {"GSPX", "{}"},
      {"DTWGS", R"({"mode": 4, "classMask": 3})"},
      {"GSETH", "{}"},
      {"LPE_P", "{}"},
      {"PDR", R"({"N": 5})"},
      {"LIFT", "{}"},
  };
  for (const auto& [sensor, option] : clients) {
    SCOPED_TRACE(option != nullptr ? option : sensor);
    void* const handle = open(sensor);
    ASSERT_NE(handle, nullptr);
    EXPECT_GT(allocations.made, 0);  // opening does, and is counted
    if (option != nullptr) set(handle, option);
    int delivered = 0;
    counted([&] {
      for (uint32_t i = 1; i <= 200; ++i) {
        delivered += dispatch(handle, static_cast<int16_t>(i % 2), i) == 1 ? 1 : 0;
        dispatch(handle, -1, i);
        dispatch(nullptr, 1);
        dispatch(&delivered, 1);
      }
      return 0;
    });
    EXPECT_EQ(allocations.made, 0);
    EXPECT_GT(delivered, 0);
    closeAll({handle});
  }
}

TEST(Sessions, LeaveNothingOnTheHeapWhenAllAreClosed) {
  for (int round = 0; round < 3; ++round) {
    allocations.live = 0;
    for (const char* sensor : {"PHYAC", "STAP", "GSPX", "PDR", "DTWGS", "LPE_P"}) {
      void* const first = open(sensor);
      void* const second = open(sensor);
      set(first, R"({"mode": 4, "classMask": 1, "logN": 8})");
      set(second, R"({"mode": 4, "classMask": 2})");
      closeAll({first, second});
    }
    tearDown();
    EXPECT_TRUE(round == 0 || allocations.live == 0);  // the first one leaves the table of sessions for the next
  }
}

#if !SENSELOOM_HAS_ASAN

TEST(FailedAllocation, OpensNoSessionAndLeavesTheOthersOpen) {
  std::vector<void*> handles;
  for (int n = 0; n < 40; ++n) {
    for (int failing = 0;; ++failing) {
      if (n == 0) tearDown();  // so that every block of the sensors themselves fails once, too
      void* const handle = open("PHYAC", failing);
      if (allocations.made > failing) {
        EXPECT_EQ(handle, nullptr);
        continue;
      }
      ASSERT_NE(handle, nullptr);
      handles.push_back(handle);
      break;
    }
    for (void* handle : handles) EXPECT_EQ(dispatch(handle, 0), 1);
  }
  for (void* handle : handles) closeAll({handle});
}

TEST(FailedAllocation, LeaksNothing) {
  for (const char* sensor : {"PHYAC", "STAP", "GSPX", "PDR", "DTWGS", "LPE_P"}) {
    SCOPED_TRACE(sensor);
    closeAll({open(sensor)});
    tearDown();
    allocations.live = 0;
    for (int failing = 0; failing < 60; ++failing) {
      ctx_option_t* list = nullptr;
      if (void* const handle = open(sensor, failing)) closeAll({handle});
      void* const first = open(sensor);
      void* const second = open(sensor);
      setOption(first, R"({"mode": 4, "classMask": 1, "logN": 2})", &list, failing);
      release(list);
      set(second, R"({"mode": 4, "classMask": 2, "logN": 3})");
      const int closed = close(first, &list, failing);
      release(list);
      if (closed == -1 && dispatch(first, 0) != -1) closeAll({first});
      closeAll({second});
      tearDown();
      EXPECT_EQ(allocations.live, 0) << failing;
    }
  }
}

// What the session's own option took of the string stays, and is in force from the negotiation on, though without a
// list.
TEST(FailedAllocation, LeavesTheOptionAsItsStringSetIt) {
  bool succeeded = false;
  for (int failing = 0; !succeeded; ++failing) {
    SCOPED_TRACE(failing);
    void* const handle = open("STAP");
    set(handle, R"({"classMask": 1})");
    ctx_option_t* list = nullptr;
    allocations.negotiationLines = 0;
    const int result = setOption(handle, R"({"classMask": 2})", &list, failing);
    succeeded = allocations.made <= failing;
    EXPECT_EQ(result, succeeded ? 0 : -1);
    EXPECT_EQ(list != nullptr, succeeded);
    const bool taken = dispatch(handle, 2) == 1;
    EXPECT_EQ(dispatch(handle, 1), taken ? 0 : 1);
    EXPECT_TRUE(taken || allocations.negotiationLines == 0);
    release(list);
    closeAll({handle});
  }
}

TEST(FailedAllocation, LeavesAnActivitySessionTheChainThatItHad) {
  bool succeeded = false;
  for (int failing = 0; !succeeded; ++failing) {
    SCOPED_TRACE(failing);
    void* const handle = open("PHYAC");
    set(handle, "{}");
    ctx_option_t* list = nullptr;
    const int result = setOption(handle, R"({"logN": 1})", &list, failing);
    succeeded = allocations.made <= failing;
    EXPECT_EQ(result, succeeded ? 0 : -1);
    EXPECT_EQ(dispatch(handle, 1), succeeded ? 0 : 1);
    release(list);
    closeAll({handle});
  }
}

// Without a copy of the first remaining session's option nothing is closed; without a list all is, which is no failure.
TEST(FailedAllocation, ClosesASessionWhollyOrNotAtAll) {
  bool succeeded = false;
  for (int failing = 0; !succeeded; ++failing) {
    SCOPED_TRACE(failing);
    void* const first = open("STAP");
    void* const second = open("STAP");
    ctx_option_t* list = nullptr;
    allocations.negotiationLines = 0;
    const int result = close(first, &list, failing);
    succeeded = allocations.made <= failing;
    EXPECT_EQ(list != nullptr, succeeded);
    release(list);
    EXPECT_EQ(dispatch(second, 1), 1);
    if (result == -1) {
      EXPECT_EQ(allocations.negotiationLines, 0);
      EXPECT_EQ(dispatch(first, 1), 1);
      closeAll({first});
    } else {
      EXPECT_EQ(result, 1);
      EXPECT_EQ(allocations.negotiationLines, 1);
      EXPECT_EQ(dispatch(first, 1), -1);
    }
    closeAll({second});
  }
}

#endif

}  // namespace
