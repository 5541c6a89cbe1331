#include <dlfcn.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <iterator>
#include <new>
#include <string>
#include <vector>

#include "library.h"
#include "platform.h"

// The library loaded and unloaded, and the objects that it makes, in their order. The program's operator new and delete
// are the library's, too.
namespace {

bool watching = false;
void* live[256];  // the blocks made while watching and not yet freed, in the order in which they were made
size_t live_blocks = 0;
const void* awaited = nullptr;  // whether this block was freed
bool awaited_freed = false;

void noteNew(void* block) {
  if (watching && live_blocks < std::size(live)) live[live_blocks++] = block;
}
void noteDelete(const void* block) {
  if (block != nullptr && block == awaited) awaited_freed = true;
  void** const end = live + live_blocks;
  void** const found = std::find(live, end, block);
  if (found == end) return;
  std::copy(found + 1, end, found);
  --live_blocks;
}

void* allocate(size_t size) {
  void* const block = std::malloc(size != 0 ? size : 1);
  if (block == nullptr) throw std::bad_alloc();
  noteNew(block);
  return block;
}
void release(void* block) {
  noteDelete(block);
  std::free(block);
}

}  // namespace

void* operator new(size_t size) {
  return allocate(size);
}
void* operator new[](size_t size) {
  return allocate(size);
}
void* operator new[](size_t size, const std::nothrow_t&) noexcept {
  return allocate(size);
}
void operator delete(void* block) noexcept {
  release(block);
}
void operator delete(void* block, size_t) noexcept {
  release(block);
}
void operator delete[](void* block) noexcept {
  release(block);
}
void operator delete[](void* block, size_t) noexcept {
  release(block);
}

namespace {

// Watches the library's blocks while it lives.
class Watch {
 public:
  Watch() { watching = true; }
  ~Watch() { watching = false; }
  Watch(const Watch&) = delete;
  Watch& operator=(const Watch&) = delete;
};

Library load() {
  return loadLibrary(LIBRARY);
}
void unload(const Library& library) {
  dlclose(library.handle);
  EXPECT_EQ(dlopen(LIBRARY, RTLD_NOW | RTLD_NOLOAD), nullptr) << "it is still there";
}

// Opens and uses a session of each of three kinds.
void open(const Library& library, void* (&handles)[3]) {
  constexpr const char* kSensors[] = {"PHYAC", "STAP", "PDR"};
  for (size_t i = 0; i < std::size(handles); ++i) {
    handles[i] = library.open(kSensors[i]);
    uint8_t record[64] = {};
    void* out = nullptr;
    int length = 0;
    record[8] = 1;
    ASSERT_EQ(library.dispatch(handles[i], record, sizeof record, &out, &length), 1) << kSensors[i];
  }
}

TEST(Unloading, LeavesNothingWhenAllIsClosedAndTheLibraryLoadsAgain) {
  for (int round = 0; round < 3; ++round) {
    const Library library = load();
    EXPECT_EQ(library.sensor("STAP"), nullptr) << "no sensor was made yet";
    {
      const Watch watch;
      void* handles[3];
      open(library, handles);
      for (void* handle : handles) {
        ctx_option_t* list = nullptr;
        EXPECT_EQ(library.setOption(handle, 0, "{}", &list), 0);
        library.release(list);
        EXPECT_EQ(library.close(handle, &list), 0);
      }
      library.uninit();
    }
    EXPECT_EQ(live_blocks, 0U) << round;
    unload(library);
  }
}

TEST(Unloading, LeavesOpenSessionsAndTheirTable) {
  for (int round = 0; round < 3; ++round) {
    const Library library = load();
    void* handles[3];
    {
      const Watch watch;
      open(library, handles);
      library.uninit();
    }
    const std::vector<void*> before(live, live + live_blocks);
    EXPECT_EQ(before.size(), 4U) << "three sessions and the table of them";
    for (void* handle : handles) EXPECT_EQ(std::count(before.begin(), before.end(), handle), 1);
    unload(library);
    EXPECT_EQ(std::vector<void*>(live, live + live_blocks), before);
    while (live_blocks > 0) release(live[0]);
  }
}

TEST(Sensors, AreMadeInTheirOrder) {
  const Library library = load();
  {
    const Watch watch;
    library.open("none");
  }
  ASSERT_EQ(live_blocks, 12U);
  size_t made = 0;
  for (const char* name :
       {"PHYAC", "STAP", "GSFLK", "SHAKI", "ISACT", "SCOUN", "GSPX", "DTWGS", "GSETH", "LPE_P", "PDR", "LIFT"}) {
    EXPECT_EQ(library.sensor(name), live[made++]) << name;
  }
  library.uninit();
  EXPECT_EQ(live_blocks, 0U);
  unload(library);
}

TEST(GestureSession, IsFreedAfterTheEngineWasClosed) {
  static bool freed_before = true;
  const Library library = load();
  awaited = library.open("GSPX");
  platform::hooks.gestureClose = [] { freed_before = awaited_freed; };
  ctx_option_t* list = nullptr;
  EXPECT_EQ(library.close(const_cast<void*>(awaited), &list), 0);
  EXPECT_FALSE(freed_before);
  EXPECT_TRUE(awaited_freed);
  library.uninit();
  unload(library);
}

}  // namespace
