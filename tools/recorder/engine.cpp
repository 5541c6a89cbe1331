#include "engine.h"

#include <dlfcn.h>

#include "recorder_names.h"

namespace senseloom::trace {
namespace {

constexpr char kName[] = "gesture_process_single_data";

// Where another program part than the library came upon the one of this library, there need not be one behind it: then
// it is the library's.
void* find() {
  if (void* next = dlsym(RTLD_NEXT, kName)) return next;
  void* library = dlopen(SENSELOOM_REAL_FILE, RTLD_LAZY);
  return library == nullptr ? nullptr : dlsym(library, kName);
}

}  // namespace

decltype(&gesture_process_single_data) engine() {
  static const auto found = reinterpret_cast<decltype(&gesture_process_single_data)>(find());
  return found;
}

}  // namespace senseloom::trace
