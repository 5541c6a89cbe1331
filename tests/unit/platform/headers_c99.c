#include "headers_c99.h"

#include <gesture.h>
#include <gesture_answers.h>
#include <hardware/aware.h>
#include <hardware/hardware.h>

layout_t layoutInC99(void) {
  const layout_t layout = {
      .device_size = sizeof(hw_device_t),
      .device_version = offsetof(hw_device_t, version),
      .device_module = offsetof(hw_device_t, module),
      .device_close = offsetof(hw_device_t, close),
      .module_size = sizeof(hw_module_t),
      .module_api_version = offsetof(hw_module_t, module_api_version),
      .module_id = offsetof(hw_module_t, id),
      .module_methods = offsetof(hw_module_t, methods),
      .module_dso = offsetof(hw_module_t, dso),
      .aware_activate = offsetof(aware_hw_device_t, activate),
      .aware_deactivate = offsetof(aware_hw_device_t, deactivate),
      .parameters_size = sizeof(aware_parameters_t),
  };
  return layout;
}
