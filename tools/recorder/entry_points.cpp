// The library's names, as the program uses them: those that are recorded, and those that are only passed on. And the
// one of the platform's names, as the library uses it, whose answers are recorded.
#include "engine.h"
#include "library.h"
#include "quick_sessions.h"
#include "recorder.h"
#include "senseloom.h"

using senseloom::trace::engine;
using senseloom::trace::gBell;
using senseloom::trace::gQuickSessions;
using senseloom::trace::library;
using senseloom::trace::QuickSessions;
using senseloom::trace::recorder;

// The library uses these two as well, in place of its own: this library is before it wherever names are looked for,
// since it needs it. (Not on Android 5, where a library finds its own names first: there they stay as they are.)
constinit aware_hw_device* device = nullptr;
constinit bool gIsActivated = false;

namespace {

[[gnu::destructor]] void atExit() {
  recorder().atExit();
}

}  // namespace

void* ctx_open_session(const char* sensor) noexcept {
  return recorder().open(sensor);
}

int ctx_set_option(void* handle, int32_t reserved, const char* option, ctx_option_t** out) noexcept {
  return recorder().setOption(handle, reserved, option, out);
}

// With nothing to record, one branch more than the library.
int ctx_dispatch_data(void* handle, void* data, int len, void** out, int* outlen) noexcept {
  auto* counts = gQuickSessions.find(handle, !gBell.isRung());
  if (counts == nullptr) return recorder().dispatch(handle, data, len, out, outlen);
  const int returned = library().dispatchData(handle, data, len, out, outlen);
  QuickSessions::count(*counts, returned == 1);
  return returned;
}

int ctx_close_session(void* handle, ctx_option_t** option) noexcept {
  return recorder().close(handle, option);
}

int32_t ctx_option_release(ctx_option_t* list) noexcept {
  return recorder().release(list);
}

void ctx_uninit() noexcept {
  recorder().uninit();
}

void* getSensor(const char* name) noexcept {
  return library().getSensor(name);
}

bool audio_hal_init() noexcept {
  return library().audioInit();
}

bool audio_hal_activate() noexcept {
  return library().audioActivate();
}

bool audio_hal_deactivate() noexcept {
  return library().audioDeactivate();
}

void* _va_init(varray_t* va, int elemSize) noexcept {
  return library().vaInit(va, elemSize);
}

void* va_new(varray_t* va) noexcept {
  return library().vaNew(va);
}

void* _va_del(varray_t* va, int index, void* out) noexcept {
  return library().vaDel(va, index, out);
}

void va_free(varray_t* va) noexcept {
  library().vaFree(va);
}

// This library is before the platform's wherever names are looked for, since it needs the library that needs that one.
char* gesture_process_single_data(const int16_t* group, int count, bool last) {
  const auto process = engine();
  char* const name = process == nullptr ? nullptr : process(group, count, last);
  recorder().engineAnswered(name);
  return name;
}
