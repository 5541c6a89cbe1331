#pragma once

#include <cstdint>
#include <span>

#include "senseloom.h"

namespace senseloom::trace {

// The functions of the library that the recording library stands in for. Where there is none, as when the recording
// library was put in its place without it, they fail.
struct Library {
  decltype(&ctx_open_session) openSession;
  decltype(&ctx_set_option) setOption;
  decltype(&ctx_dispatch_data) dispatchData;
  decltype(&ctx_close_session) closeSession;
  decltype(&ctx_option_release) optionRelease;
  decltype(&ctx_uninit) uninit;
  decltype(&::getSensor) getSensor;
  decltype(&audio_hal_init) audioInit;
  decltype(&audio_hal_activate) audioActivate;
  decltype(&audio_hal_deactivate) audioDeactivate;
  decltype(&_va_init) vaInit;
  decltype(&va_new) vaNew;
  decltype(&_va_del) vaDel;
  decltype(&va_free) vaFree;
};

// They are looked up with the first call.
const Library& library();

// The file that they are in; empty without one.
const char* libraryFile();

// The number that the linker gave to the library's build; empty if it gave none.
std::span<const uint8_t> libraryBuild();

}  // namespace senseloom::trace
