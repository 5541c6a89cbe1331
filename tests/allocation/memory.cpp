#include "memory.h"

#include <hardware/hardware.h>
#include <jansson.h>
#include <senseloom.h>

#include <cstdarg>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <functional>
#include <new>
#include <string>
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

int calls = 0;   // of the library that are under way
int exempt = 0;  // calls of the platform that are under way within

size_t until_failure = 0;  // allocations left, the one that fails included; 0: none fails
bool fails_for_ever = false;
bool has_failed = false;

// Makes an allocation of the library, or lets it fail.
template <class Allocate>
void* watched(size_t size, const Allocate& allocate) {
  if (calls == 0 || exempt > 0) return allocate();
  if (until_failure == 1) {
    has_failed = true;
    if (!fails_for_ever) until_failure = 0;
    return nullptr;
  }
  if (until_failure > 1) --until_failure;
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

void* newBlock(size_t size) {
  void* block = watched(size, [=] { return __real_malloc(size != 0 ? size : 1); });
  if (block == nullptr) throw std::bad_alloc();
  return block;
}

// While one lives, a counter is one higher.
class Raised {
 public:
  explicit Raised(int& which) : counter(which) { ++counter; }
  ~Raised() { --counter; }
  Raised(const Raised&) = delete;
  Raised& operator=(const Raised&) = delete;

 private:
  int& counter;
};

}  // namespace

namespace memory {

void failAt(size_t which, bool forEver) {
  until_failure = which;
  fails_for_ever = forEver;
  has_failed = false;
}

bool stopFailing() {
  until_failure = 0;
  return has_failed;
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
    const Raised call(calls);                            \
    return __real_##function arguments;                  \
  }

// --- the calls of the platform, which are made within

#define EXEMPT(Result, function, parameters, arguments) \
  Result __real_##function parameters;                  \
  Result __wrap_##function parameters {                 \
    const Raised call(exempt);                          \
    return __real_##function arguments;                 \
  }

namespace {

// The device's operations are called through pointers; these stand before them.
struct Device {
  hw_device_t common;
  int (*activate)(Device*, const void*);
  int (*deactivate)(Device*);
};
const hw_module_t* real_module = nullptr;
Device real_device;

int openExempt(const hw_module_t*, const char* id, hw_device_t** device) {
  const Raised call(exempt);
  const int result = real_module->methods->open(real_module, id, device);
  if (result != 0 || *device == nullptr) return result;
  auto* opened = reinterpret_cast<Device*>(*device);
  real_device = *opened;
  opened->activate = [](Device* self, const void* block) {
    const Raised within(exempt);
    return real_device.activate(self, block);
  };
  opened->deactivate = [](Device* self) {
    const Raised within(exempt);
    return real_device.deactivate(self);
  };
  opened->common.close = [](hw_device_t* self) {
    const Raised within(exempt);
    return real_device.common.close(self);
  };
  return result;
}

hw_module_methods_t exempt_methods = {openExempt};
const hw_module_t exempt_module = [] {
  hw_module_t module{};
  module.methods = &exempt_methods;
  return module;
}();

}  // namespace

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

EXEMPT(int, puts, (const char* text), (text))
EXEMPT(bool, gesture_initial, (int first, int second), (first, second))
EXEMPT(char*, gesture_process_single_data, (const int16_t* group, int count, bool last), (group, count, last))
EXEMPT(void, gesture_close, (void), ())
int __real_hw_get_module_by_class(const char* classId, const char* inst, const hw_module_t** module);
int __wrap_hw_get_module_by_class(const char* classId, const char* inst, const hw_module_t** module) {
  const Raised call(exempt);
  const int result = __real_hw_get_module_by_class(classId, inst, &real_module);
  if (result == 0) *module = &exempt_module;
  return result;
}

int __real___android_log_print(int priority, const char* tag, const char* format, ...);
int __wrap___android_log_print(int priority, const char* tag, const char* format, ...) {
  const Raised call(exempt);
  va_list arguments;
  va_start(arguments, format);
  va_list again;
  va_copy(again, arguments);
  std::string text(static_cast<size_t>(std::vsnprintf(nullptr, 0, format, arguments)), '\0');
  va_end(arguments);
  std::vsnprintf(text.data(), text.size() + 1, format, again);
  va_end(again);
  return __real___android_log_print(priority, tag, "%s", text.c_str());
}

}  // extern "C"
