#pragma once

#include <dlfcn.h>
#include <senseloom.h>

#include <cstdio>
#include <cstdlib>

// The library as a program loads it, or, without a path, as it is linked with it.
struct Library {
  void* handle = nullptr;
  decltype(&ctx_open_session) open = nullptr;
  decltype(&ctx_set_option) setOption = nullptr;
  decltype(&ctx_dispatch_data) dispatch = nullptr;
  decltype(&ctx_close_session) close = nullptr;
  decltype(&ctx_option_release) release = nullptr;
  decltype(&ctx_uninit) uninit = nullptr;
  decltype(&getSensor) sensor = nullptr;
};

inline void require(bool condition, const char* what) {
  if (condition) return;
  std::fprintf(stderr, "failed: %s\n", what);
  std::_Exit(1);
}
#define REQUIRE(condition) require(condition, #condition)

template <class Function>
void findFunction(void* library, const char* name, Function& function) {
  function = reinterpret_cast<Function>(dlsym(library, name));
  require(function != nullptr, name);
}

inline Library loadLibrary(const char* path) {
  Library library;
  library.handle = dlopen(path, RTLD_NOW | RTLD_LOCAL);
  if (library.handle == nullptr) require(false, dlerror());
  findFunction(library.handle, "ctx_open_session", library.open);
  findFunction(library.handle, "ctx_set_option", library.setOption);
  findFunction(library.handle, "ctx_dispatch_data", library.dispatch);
  findFunction(library.handle, "ctx_close_session", library.close);
  findFunction(library.handle, "ctx_option_release", library.release);
  findFunction(library.handle, "ctx_uninit", library.uninit);
  findFunction(library.handle, "getSensor", library.sensor);
  return library;
}
