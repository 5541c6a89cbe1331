#pragma once

#include <hardware/hardware.h>

// A platform that does what it is asked for and keeps nothing of it. It allocates nothing but the names of gestures. A
// test that wants more of it sets a hook.
namespace platform {

struct Device {
  hw_device_t common;
  int (*activate)(Device*, void* parameters);
  int (*deactivate)(Device*);
};
// The aware audio device.
extern Device aware_device;

struct Hooks {
  void (*logged)(const char* text) = nullptr;
  int loaderResult = 0;
  int (*open)(hw_device_t** opened) = nullptr;
  void (*activate)(void* parameters) = nullptr;
  void (*deactivate)() = nullptr;
  void (*close)() = nullptr;
  void (*gestureClose)() = nullptr;
};
inline Hooks hooks;

}  // namespace platform
