// A platform that always does what it is asked for, and keeps nothing of it: millions of calls are made.

#include <quiet_aware_module.h>

#include <cstdint>
#include <cstring>

extern "C" {

int __android_log_print(int, const char*, const char*, ...) {
  return 0;
}

int hw_get_module_by_class(const char*, const char*, const hw_module_t** module) {
  *module = &quiet::aware_module;
  return 0;
}

bool gesture_initial(int, int) {
  return true;
}

char* gesture_process_single_data(const int16_t*, int, bool last) {
  constexpr char kName[] = "LetterA ";
  return last ? static_cast<char*>(std::memcpy(new char[sizeof kName], kName, sizeof kName)) : nullptr;
}

void gesture_close() {}

}  // extern "C"
