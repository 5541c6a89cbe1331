#include <android/log.h>
#include <quiet_aware_module.h>

#include <cstdint>

#include "allocations.h"

// A platform that works and allocates nothing, but for the name of a gesture, which is not counted.
extern "C" {

int __android_log_print(int, const char* tag, const char*, ...) {
  if (tag[0] == 'L') ++api::allocations.negotiationLines;
  return 0;
}

int hw_get_module_by_class(const char*, const char*, const hw_module_t** module) {
  *module = &quiet::aware_module;
  return 0;
}

bool gesture_initial(int, int) {
  return true;
}

char* gesture_process_single_data(const int16_t*, int, bool) {
  const api::AllocationsUncounted uncounted;
  return new char[]{"LetterA "};
}

void gesture_close() {}
}
