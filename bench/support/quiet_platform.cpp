// The functions that the library imports from the platform, doing nothing: what is measured is the library. They are
// the program's own and so stand before those of the platform's libraries.
#include <android/log.h>
#include <hardware/hardware.h>

#include <cerrno>
#include <cstdint>

extern "C" {

int __android_log_print(int /*priority*/, const char* /*tag*/, const char* /*format*/, ...) {
  return 0;
}

int hw_get_module_by_class(const char* /*class_id*/, const char* /*inst*/, const hw_module_t** /*module*/) {
  return -ENOENT;
}

bool gesture_initial(int /*first*/, int /*second*/) {
  return true;
}
char* gesture_process_single_data(const int16_t* /*group*/, int /*count*/, bool /*last*/) {
  return nullptr;
}
void gesture_close() {}
}
