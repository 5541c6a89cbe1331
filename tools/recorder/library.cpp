#include "library.h"

#include <android/log.h>
#include <dlfcn.h>

#include <type_traits>

#include "recorder_names.h"

namespace senseloom::trace {
namespace {

template <class Result, class... Arguments>
Result fail(Arguments...) noexcept {
  if constexpr (std::is_same_v<Result, int>) return -1;
  if constexpr (!std::is_void_v<Result>) return Result();
}

template <class Result, class... Arguments>
void find(void* handle, const char* name, Result (*&function)(Arguments...) noexcept) {
  void* found = handle == nullptr ? nullptr : dlsym(handle, name);
  function = found == nullptr ? fail<Result, Arguments...> : reinterpret_cast<Result (*)(Arguments...) noexcept>(found);
}

// The library is loaded already, since this one needs it, and is never unloaded before. By a handle, the search begins
// in the library, while the default search would end here.
Library load() {
  void* handle = dlopen(SENSELOOM_REAL_FILE, RTLD_LAZY);
  if (handle == nullptr) __android_log_print(ANDROID_LOG_ERROR, "senseloom-trace", "no library: %s", dlerror());
  Library found{};
  find(handle, "ctx_open_session", found.openSession);
  find(handle, "ctx_set_option", found.setOption);
  find(handle, "ctx_dispatch_data", found.dispatchData);
  find(handle, "ctx_close_session", found.closeSession);
  find(handle, "ctx_option_release", found.optionRelease);
  find(handle, "ctx_uninit", found.uninit);
  find(handle, "getSensor", found.getSensor);
  find(handle, "audio_hal_init", found.audioInit);
  find(handle, "audio_hal_activate", found.audioActivate);
  find(handle, "audio_hal_deactivate", found.audioDeactivate);
  find(handle, "_va_init", found.vaInit);
  find(handle, "va_new", found.vaNew);
  find(handle, "_va_del", found.vaDel);
  find(handle, "va_free", found.vaFree);
  return found;
}

}  // namespace

const Library& library() {
  static const Library loaded = load();
  return loaded;
}

const char* libraryFile() {
  Dl_info info{};
  void* function = reinterpret_cast<void*>(library().openSession);
  if (dladdr(function, &info) == 0 || info.dli_fname == nullptr) return "";
  return info.dli_fname;
}

}  // namespace senseloom::trace
