#include <dlfcn.h>

#include <cstddef>
#include <new>

#include "recorder.h"
#include "senseloom.h"

// The library's functions, as the program calls them: each passes the call on to the next definition, which is the
// library's, and has it recorded.
namespace senseloom::trace {
namespace {

// Never destroyed: programs close sessions in destructors of their own, some of which run after those of this library.
Recorder& recorder() {
  alignas(Recorder) static std::byte storage[sizeof(Recorder)];
  static Recorder* const instance = new (storage) Recorder;
  return *instance;
}

[[gnu::destructor]] void atExit() {
  recorder().atExit();
}

// Null if the library was loaded with local scope only. A program then gets here only by asking the loader for any
// function of this name.
template <class Function>
Function* nextDefinition(const char* name) {
  return reinterpret_cast<Function*>(dlsym(RTLD_NEXT, name));
}

// Whether there is the sensor that the last call tried to open.
bool sensorExists(const char* name) {
  static const auto next = nextDefinition<decltype(getSensor)>("getSensor");
  return next != nullptr && next(name) != nullptr;
}

}  // namespace
}  // namespace senseloom::trace

using senseloom::trace::nextDefinition;
using senseloom::trace::recorder;

void* ctx_open_session(const char* sensor) noexcept {
  static const auto next = nextDefinition<decltype(ctx_open_session)>("ctx_open_session");
  if (next == nullptr) return nullptr;
  void* handle = next(sensor);
  recorder().opened(sensor, senseloom::trace::sensorExists(sensor), handle);
  return handle;
}

int ctx_set_option(void* handle, int32_t reserved, const char* option, ctx_option_t** out) noexcept {
  static const auto next = nextDefinition<decltype(ctx_set_option)>("ctx_set_option");
  if (next == nullptr) return -1;
  recorder().beforeSetOption(handle, option, out);
  const int returned = next(handle, reserved, option, out);
  recorder().negotiated(returned, out);
  return returned;
}

int ctx_dispatch_data(void* handle, void* data, int len, void** out, int* outlen) noexcept {
  static const auto next = nextDefinition<decltype(ctx_dispatch_data)>("ctx_dispatch_data");
  if (next == nullptr) return -1;
  recorder().beforeDispatch(handle, data, len, out, outlen);
  const int returned = next(handle, data, len, out, outlen);
  recorder().dispatched(returned, out, outlen);
  return returned;
}

int ctx_close_session(void* handle, ctx_option_t** option) noexcept {
  static const auto next = nextDefinition<decltype(ctx_close_session)>("ctx_close_session");
  if (next == nullptr) return -1;
  recorder().beforeClose(handle, option);
  const int returned = next(handle, option);
  recorder().closed(handle, returned, option);
  return returned;
}

void ctx_uninit() noexcept {
  static const auto next = nextDefinition<decltype(ctx_uninit)>("ctx_uninit");
  if (next == nullptr) return;
  next();
  recorder().uninitialised();
}
