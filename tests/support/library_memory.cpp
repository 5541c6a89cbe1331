#include "library_memory.h"

#include <jansson.h>
#include <senseloom.h>

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <functional>
#include <new>
#include <unordered_map>
#include <utility>

// The linker sends each reference to a function F of the list in CMakeLists.txt to __wrap_F, and to F those to
// __real_F.

extern "C" {
void* __real_malloc(size_t size);
void* __real_calloc(size_t count, size_t size);
void* __real_realloc(void* block, size_t size);
void __real_free(void* block);
}

namespace {

// For what is noted here itself.
template <class Type>
struct Unwatched {
  using value_type = Type;
  Unwatched() = default;
  template <class Other>
  Unwatched(const Unwatched<Other>&) {}
  Type* allocate(size_t count) { return static_cast<Type*>(__real_malloc(count * sizeof(Type))); }
  void deallocate(Type* block, size_t) { __real_free(block); }
  bool operator==(const Unwatched&) const = default;
};
using Blocks =
    std::unordered_map<void*, size_t, std::hash<void*>, std::equal_to<>, Unwatched<std::pair<void* const, size_t>>>;

Blocks& liveBlocks() {
  static auto* const blocks = new (__real_malloc(sizeof(Blocks))) Blocks;  // lives as long as the last free()
  return *blocks;
}
size_t live_bytes = 0;
size_t asked_for = 0;

int calls = 0;   // of the library that are under way
int exempt = 0;  // objects of Exempt

size_t until_failure = 0;  // allocations left, the one that fails included; 0: none fails
bool fails_for_ever = false;
size_t most_bytes = SIZE_MAX;
bool has_failed = false;

// Makes an allocation of the library, or lets it fail.
template <class Allocate>
void* watched(size_t size, const Allocate& allocate) {
  if (calls == 0 || exempt > 0) return allocate();
  ++asked_for;
  if (until_failure == 1) {
    has_failed = true;
    if (!fails_for_ever) until_failure = 0;
    return nullptr;
  }
  if (until_failure > 1) --until_failure;
  if (size > most_bytes - std::min(most_bytes, live_bytes)) {
    has_failed = true;
    return nullptr;
  }
  void* block = allocate();
  if (block == nullptr) return nullptr;
  liveBlocks()[block] = size;
  live_bytes += size;
  return block;
}

void forget(void* block) {
  if (liveBlocks().empty()) return;
  const auto found = liveBlocks().find(block);
  if (found == liveBlocks().end()) return;
  live_bytes -= found->second;
  liveBlocks().erase(found);
}

void* newBlockOrNull(size_t size) {
  return watched(size, [=] { return __real_malloc(size != 0 ? size : 1); });
}

void* newBlock(size_t size) {
  void* block = newBlockOrNull(size);
  if (block == nullptr) throw std::bad_alloc();
  return block;
}

}  // namespace

namespace memory {

void failAt(size_t which, bool forEver) {
  until_failure = which;
  fails_for_ever = forEver;
  has_failed = false;
}

void failAbove(size_t bytes) {
  most_bytes = bytes;
  has_failed = false;
}

bool stopFailing() {
  until_failure = 0;
  most_bytes = SIZE_MAX;
  return has_failed;
}

bool hasFailed() {
  return has_failed;
}

size_t allocations() {
  return asked_for;
}

Within::Within() {
  ++calls;
}
Within::~Within() {
  --calls;
}

Exempt::Exempt() {
  ++exempt;
}
Exempt::~Exempt() {
  --exempt;
}

size_t blocks() {
  return liveBlocks().size();
}
size_t bytes() {
  return live_bytes;
}

}  // namespace memory

// --- the allocating functions

void* operator new(size_t size) {
  return newBlock(size);
}
void* operator new[](size_t size) {
  return newBlock(size);
}
// A sanitizer would have its own of these.
void* operator new(size_t size, const std::nothrow_t&) noexcept {
  return newBlockOrNull(size);
}
void* operator new[](size_t size, const std::nothrow_t&) noexcept {
  return newBlockOrNull(size);
}
void operator delete(void* block) noexcept {
  std::free(block);
}
void operator delete(void* block, size_t) noexcept {
  std::free(block);
}
void operator delete[](void* block) noexcept {
  std::free(block);
}
void operator delete[](void* block, size_t) noexcept {
  std::free(block);
}

extern "C" {

void* __wrap_malloc(size_t size) {
  return watched(size, [=] { return __real_malloc(size); });
}

void* __wrap_calloc(size_t count, size_t size) {
  return watched(count * size, [=] { return __real_calloc(count, size); });
}

void* __wrap_realloc(void* block, size_t size) {
  void* moved = watched(size, [=] { return __real_realloc(block, size); });
  if (moved != nullptr && moved != block) forget(block);
  return moved;
}

void __wrap_free(void* block) {
  forget(block);
  __real_free(block);
}

}  // extern "C"

// The parser is in a shared library, out of the linker's reach.
[[maybe_unused]] static const bool json_is_watched = (json_set_alloc_funcs(std::malloc, std::free), true);

// --- the calls of the library

#define WATCHED(Result, function, parameters, arguments) \
  Result __real_##function parameters noexcept;          \
  Result __wrap_##function parameters noexcept {         \
    const memory::Within call;                           \
    return __real_##function arguments;                  \
  }

extern "C" {

WATCHED(void*, ctx_open_session, (const char* sensor), (sensor))
WATCHED(int, ctx_set_option, (void* handle, int32_t reserved, const char* option, ctx_option_t** out),
        (handle, reserved, option, out))
WATCHED(int, ctx_dispatch_data, (void* handle, void* data, int len, void** out, int* outlen),
        (handle, data, len, out, outlen))
WATCHED(int, ctx_close_session, (void* handle, ctx_option_t** option), (handle, option))
WATCHED(int32_t, ctx_option_release, (ctx_option_t * list), (list))
WATCHED(void, ctx_uninit, (void), ())
WATCHED(bool, audio_hal_init, (void), ())
WATCHED(bool, audio_hal_activate, (void), ())
WATCHED(bool, audio_hal_deactivate, (void), ())
WATCHED(void*, _va_init, (varray_t * va, int elemSize), (va, elemSize))
WATCHED(void*, va_new, (varray_t * va), (va))
WATCHED(void*, _va_del, (varray_t * va, int index, void* out), (va, index, out))
WATCHED(void, va_free, (varray_t * va), (va))

}  // extern "C"
