// Stands before each function of the fakes of the platform, so that what these allocate is exempt.

#include <formatted.h>
#include <hardware/hardware.h>

#include <cstdarg>
#include <cstdint>
#include <cstdio>
#include <string>

#include "library_memory.h"

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
  const memory::Exempt exempt;
  const int result = real_module->methods->open(real_module, id, device);
  if (result != 0 || *device == nullptr) return result;
  auto* opened = reinterpret_cast<Device*>(*device);
  real_device = *opened;
  opened->activate = [](Device* self, const void* block) {
    const memory::Exempt within;
    return real_device.activate(self, block);
  };
  opened->deactivate = [](Device* self) {
    const memory::Exempt within;
    return real_device.deactivate(self);
  };
  opened->common.close = [](hw_device_t* self) {
    const memory::Exempt within;
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

#define EXEMPT(Result, function, parameters, arguments) \
  Result __real_##function parameters;                  \
  Result __wrap_##function parameters {                 \
    const memory::Exempt exempt;                        \
    return __real_##function arguments;                 \
  }

extern "C" {

EXEMPT(int, puts, (const char* text), (text))
EXEMPT(bool, gesture_initial, (int first, int second), (first, second))
EXEMPT(char*, gesture_process_single_data, (const int16_t* group, int count, bool last), (group, count, last))
EXEMPT(void, gesture_close, (void), ())

int __real_hw_get_module_by_class(const char* classId, const char* inst, const hw_module_t** module);
int __wrap_hw_get_module_by_class(const char* classId, const char* inst, const hw_module_t** module) {
  const memory::Exempt exempt;
  const int result = __real_hw_get_module_by_class(classId, inst, &real_module);
  if (result == 0) *module = &exempt_module;
  return result;
}

int __real___android_log_print(int priority, const char* tag, const char* format, ...);
int __wrap___android_log_print(int priority, const char* tag, const char* format, ...) {
  const memory::Exempt exempt;
  va_list arguments;
  va_start(arguments, format);
  const std::string text = fake::formatted(format, arguments);
  va_end(arguments);
  return __real___android_log_print(priority, tag, "%s", text.c_str());
}

}  // extern "C"
