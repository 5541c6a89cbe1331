#include "platform.h"

#include <android/log.h>
#include <gesture.h>
#include <hardware/aware.h>
#include <hardware/hardware.h>
#include <stdbool.h>
#include <stddef.h>
#include <stdint.h>
#include <stdlib.h>
#include <string.h>

int platform_calls = 0;
int misaligned_calls = 0;

/* The frame begins below the return address and the caller's frame pointer. */
#define NOTE_CALL() note_call((uintptr_t)__builtin_frame_address(0))
static void note_call(uintptr_t frame) {
  ++platform_calls;
#ifdef __i386__
  if (frame % 16 != 8) ++misaligned_calls;
#else
  (void)frame;
#endif
}

static int close_device(hw_device_t* device) {
  (void)device;
  NOTE_CALL();
  return 0;
}
static int activate(aware_hw_device_t* device, const aware_parameters_t* parameters) {
  (void)device, (void)parameters;
  NOTE_CALL();
  return 0;
}
static int deactivate(aware_hw_device_t* device) {
  (void)device;
  NOTE_CALL();
  return 0;
}

static aware_hw_device_t aware_device = {.common = {.version = AWARE_DEVICE_API_VERSION_2_0, .close = close_device},
                                         .activate = activate,
                                         .deactivate = deactivate};

static int open_device(const hw_module_t* module, const char* id, hw_device_t** device) {
  (void)module, (void)id;
  NOTE_CALL();
  *device = &aware_device.common;
  return 0;
}

int hw_get_module_by_class(const char* class_id, const char* inst, const hw_module_t** module) {
  static hw_module_methods_t methods = {open_device};
  static const hw_module_t aware_module = {.methods = &methods};
  (void)class_id, (void)inst;
  NOTE_CALL();
  *module = &aware_module;
  return 0;
}

int __android_log_print(int priority, const char* tag, const char* format, ...) {
  (void)priority, (void)tag, (void)format;
  NOTE_CALL();
  return 0;
}

bool gesture_initial(int first, int second) {
  (void)first, (void)second;
  NOTE_CALL();
  return true;
}

/* The caller deletes the name with operator delete[], which is free() in all C++ libraries there are. */
char* gesture_process_single_data(const int16_t* samples, int count, bool last) {
  static const char kName[] = "LetterA ";
  (void)samples, (void)count;
  NOTE_CALL();
  char* const name = last ? malloc(sizeof kName) : NULL;
  return name != NULL ? memcpy(name, kName, sizeof kName) : NULL;
}

void gesture_close(void) {
  NOTE_CALL();
}
