#include "platform.h"

#include <android/log.h>

#include <cstdarg>
#include <cstdint>
#include <cstdio>
#include <cstring>

namespace platform {
namespace {

template <class... Parameters>
void call(void (*hook)(Parameters...), Parameters... arguments) {
  if (hook != nullptr) hook(arguments...);
}

hw_module_methods_t methods = {[](const hw_module_t*, const char*, hw_device_t** opened) {
  if (hooks.open != nullptr) return hooks.open(opened);
  *opened = &aware_device.common;
  return 0;
}};

const hw_module_t kModule = [] {
  hw_module_t made{};
  made.methods = &methods;
  return made;
}();

}  // namespace

Device aware_device = [] {
  Device made{};
  made.common.version = HARDWARE_DEVICE_API_VERSION(2, 0);
  made.common.close = [](hw_device_t*) {
    call(hooks.close);
    return 0;
  };
  made.activate = [](Device*, void* parameters) {
    call(hooks.activate, parameters);
    return 0;
  };
  made.deactivate = [](Device*) {
    call(hooks.deactivate);
    return 0;
  };
  return made;
}();

}  // namespace platform

extern "C" {

int __android_log_print(int, const char*, const char* format, ...) {
  if (platform::hooks.logged == nullptr) return 0;
  char text[512];
  va_list arguments;
  va_start(arguments, format);
  const int length = std::vsnprintf(text, sizeof text, format, arguments);
  va_end(arguments);
  platform::hooks.logged(text);
  return length;
}

int hw_get_module_by_class(const char*, const char*, const hw_module_t** module) {
  *module = &platform::kModule;
  return platform::hooks.loaderResult;
}

bool gesture_initial(int, int) {
  return true;
}

char* gesture_process_single_data(const int16_t*, int, bool last) {
  constexpr char kName[] = "LetterA ";
  return last ? static_cast<char*>(std::memcpy(new char[sizeof kName], kName, sizeof kName)) : nullptr;
}

void gesture_close() {
  platform::call(platform::hooks.gestureClose);
}

}  // extern "C"
