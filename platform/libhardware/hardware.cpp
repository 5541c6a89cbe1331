// Finds hardware modules by class and instance, and loads them.

#include <android/log.h>
#include <dlfcn.h>
#include <hardware/hardware.h>
#include <unistd.h>

#include <cerrno>
#include <climits>
#include <cstddef>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string_view>

namespace {

constexpr char kTag[] = "libhardware";
constexpr char kPathVariable[] = "SENSELOOM_HW_MODULE_PATH";

// Whether the directory has a readable file of that name. If so, its path is in `path`.
bool findIn(std::string_view directory, const char* name, char (&path)[PATH_MAX]) {
  if (directory.empty()) return false;  // not the working directory, whose code would be loaded by accident
  const int length =
      std::snprintf(path, sizeof path, "%.*s/%s", static_cast<int>(directory.size()), directory.data(), name);
  return length > 0 && static_cast<std::size_t>(length) < sizeof path && access(path, R_OK) == 0;
}

bool findInList(std::string_view list, const char* name, char (&path)[PATH_MAX]) {
  while (!list.empty()) {
    const std::size_t end = list.find(':');
    if (findIn(list.substr(0, end), name, path)) return true;
    list.remove_prefix(end == list.npos ? list.size() : end + 1);
  }
  return false;
}

bool findBesideThisLibrary(const char* name, char (&path)[PATH_MAX]) {
  Dl_info library;
  // An object of this file, since the address of an exported function may lie in the executable.
  if (dladdr(kTag, &library) == 0) return false;
  const std::string_view file = library.dli_fname;
  const std::size_t slash = file.rfind('/');
  return slash != file.npos && findIn(file.substr(0, slash), name, path);
}

int load(const char* class_id, const char* path, const hw_module_t** module) {
  void* const handle = dlopen(path, RTLD_NOW);
  if (handle == nullptr) {
    __android_log_print(ANDROID_LOG_ERROR, kTag, "%s", dlerror());
    return -EINVAL;
  }
  auto* const found = static_cast<hw_module_t*>(dlsym(handle, HAL_MODULE_INFO_SYM_AS_STR));
  if (found == nullptr) {
    __android_log_print(ANDROID_LOG_ERROR, kTag, "%s: no symbol %s", path, HAL_MODULE_INFO_SYM_AS_STR);
    dlclose(handle);
    return -EINVAL;
  }
  if (std::strcmp(class_id, found->id) != 0) {
    __android_log_print(ANDROID_LOG_ERROR, kTag, "%s: id is %s, not %s", path, found->id, class_id);
    dlclose(handle);
    return -EINVAL;
  }
  found->dso = handle;
  *module = found;
  return 0;
}

}  // namespace

int hw_get_module_by_class(const char* class_id, const char* inst, const hw_module_t** module) {
  *module = nullptr;

  char name[NAME_MAX + 1];
  const int length = inst != nullptr ? std::snprintf(name, sizeof name, "%s.%s.default.so", class_id, inst)
                                     : std::snprintf(name, sizeof name, "%s.default.so", class_id);
  // A truncated name could be that of another module.
  if (length < 0 || static_cast<std::size_t>(length) >= sizeof name) return -ENAMETOOLONG;

  const char* const list = std::getenv(kPathVariable);
  char path[PATH_MAX];
  if (!findInList(list != nullptr ? list : "", name, path) && !findBesideThisLibrary(name, path)) return -ENOENT;
  return load(class_id, path, module);
}

int hw_get_module(const char* id, const hw_module_t** module) {
  return hw_get_module_by_class(id, nullptr, module);
}
