#include <dlfcn.h>

#include <cstddef>
#include <new>

#include "recorder.h"
#include "senseloom.h"

// The library's functions, as the program calls them: each makes the same call of the next definition, the library's,
// and has it recorded.
namespace senseloom::trace {
namespace {

// Never destroyed: programs close their sessions in destructors of their own, some after everything here is done.
Recorder& recorder() {
  alignas(Recorder) static std::byte storage[sizeof(Recorder)];
  static Recorder* const instance = new (storage) Recorder;
  return *instance;
}

[[gnu::destructor]] void atExit() {
  recorder().atExit();
}

// Null when the program loaded the library for itself alone. It gets here then only by asking the loader for a function
// of this name wherever it is.
template <class Function>
Function* nextDefinition(const char* name) {
  return reinterpret_cast<Function*>(dlsym(RTLD_NEXT, name));
}

// Of the sensor that the call before this one was to open.
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
