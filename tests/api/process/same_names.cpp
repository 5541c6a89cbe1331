// A program with functions of its own that have the names of the library's and that the dynamic linker finds first. The
// library, loaded from the path in the argument, must not call them.

#include <initializer_list>

#include "library.h"

namespace {

[[noreturn]] void called(const char* name) {
  std::fprintf(stderr, "the library called the program's %s\n", name);
  std::_Exit(1);
}

}  // namespace

#define SAME_NAME(Result, name, ...)  \
  Result name(__VA_ARGS__) noexcept { \
    called(#name);                    \
  }

extern "C" {
SAME_NAME(void*, ctx_open_session, const char*)
SAME_NAME(int, ctx_set_option, void*, int32_t, const char*, ctx_option_t**)
SAME_NAME(int, ctx_dispatch_data, void*, void*, int, void**, int*)
SAME_NAME(int, ctx_close_session, void*, ctx_option_t**)
SAME_NAME(int32_t, ctx_option_release, ctx_option_t*)
SAME_NAME(void, ctx_uninit, )
SAME_NAME(void*, getSensor, const char*)
SAME_NAME(bool, audio_hal_init, )
SAME_NAME(bool, audio_hal_activate, )
SAME_NAME(bool, audio_hal_deactivate, )
SAME_NAME(void*, _va_init, varray_t*, int)
SAME_NAME(void*, va_new, varray_t*)
SAME_NAME(void*, _va_del, varray_t*, int, void*)
SAME_NAME(void, va_free, varray_t*)
}

namespace {

void useAudioBridge(const Library& library) {
  decltype(&audio_hal_init) call = nullptr;
  for (const char* name : {"audio_hal_init", "audio_hal_activate", "audio_hal_deactivate"}) {
    findFunction(library.handle, name, call);
    REQUIRE(call());
  }
}

void useArray(const Library& library) {
  decltype(&_va_init) init = nullptr;
  decltype(&va_new) append = nullptr;
  decltype(&va_free) release = nullptr;
  findFunction(library.handle, "_va_init", init);
  findFunction(library.handle, "va_new", append);
  findFunction(library.handle, "va_free", release);
  varray_t array{};
  REQUIRE(init(&array, 1) != nullptr);
  for (int i = 0; i < 17; ++i) REQUIRE(append(&array) != nullptr);
  release(&array);
}

void useSessions(const Library& library) {
  char record[24] = {};
  void* out = nullptr;
  int length = 0;
  REQUIRE(library.dispatch(record, record, sizeof record, &out, &length) == -1);  // makes the sensors
  REQUIRE(library.sensor("PHYAC") != nullptr);
  for (const char* sensor : {"PHYAC", "GSPX", "LPE_P"}) {
    void* const first = library.open(sensor);
    void* const second = library.open(sensor);
    REQUIRE(first != nullptr && second != nullptr);
    ctx_option_t* list = nullptr;
    REQUIRE(library.setOption(first, 0, "{}", &list) == 0);
    library.release(list);
    REQUIRE(library.dispatch(first, record, sizeof record, &out, &length) >= 0);
    REQUIRE(library.close(first, &list) == 1);
    library.release(list);
    REQUIRE(library.close(second, &list) == 0);
  }
  library.uninit();
}

}  // namespace

int main(int, char** argv) {
  const Library library = loadLibrary(argv[1]);
  useSessions(library);
  useAudioBridge(library);
  useArray(library);
  dlclose(library.handle);
}
