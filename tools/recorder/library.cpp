#include "library.h"

#include <android/log.h>
#include <dlfcn.h>
#include <elf.h>
#include <link.h>

#include <cstddef>
#include <cstring>
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

Dl_info libraryInfo() {
  Dl_info info{};
  dladdr(reinterpret_cast<void*>(library().openSession), &info);
  return info;
}

struct BuildSearch {
  const void* base;  // of the library
  std::span<const uint8_t> found;
};

// Notes are a header, a name and what they say, each of the latter two rounded up to four bytes.
std::span<const uint8_t> buildIn(const uint8_t* note, const uint8_t* end) {
  constexpr size_t kAlignment = 4;
  const auto roundedUp = [](size_t size) { return (size + kAlignment - 1) / kAlignment * kAlignment; };
  while (note + sizeof(ElfW(Nhdr)) <= end) {
    ElfW(Nhdr) header;
    std::memcpy(&header, note, sizeof header);
    const bool isGnu = header.n_namesz == sizeof "GNU" && std::memcmp(note + sizeof header, "GNU", sizeof "GNU") == 0;
    const uint8_t* said = note + sizeof header + roundedUp(header.n_namesz);
    if (isGnu && header.n_type == NT_GNU_BUILD_ID && said + header.n_descsz <= end) return {said, header.n_descsz};
    note = said + roundedUp(header.n_descsz);
  }
  return {};
}

int findBuild(dl_phdr_info* object, size_t /*size*/, void* wanted) {
  auto* search = static_cast<BuildSearch*>(wanted);
  if (reinterpret_cast<const void*>(object->dlpi_addr) != search->base) return 0;
  for (const ElfW(Phdr) & segment : std::span(object->dlpi_phdr, object->dlpi_phnum)) {
    if (segment.p_type != PT_NOTE || !search->found.empty()) continue;
    const auto* notes = reinterpret_cast<const uint8_t*>(object->dlpi_addr + segment.p_vaddr);
    search->found = buildIn(notes, notes + segment.p_memsz);
  }
  return 1;
}

}  // namespace

const Library& library() {
  static const Library loaded = load();
  return loaded;
}

const char* libraryFile() {
  const char* name = libraryInfo().dli_fname;
  return name == nullptr ? "" : name;
}

std::span<const uint8_t> libraryBuild() {
  BuildSearch search{.base = libraryInfo().dli_fbase, .found = {}};
  dl_iterate_phdr(findBuild, &search);
  return search.found;
}

}  // namespace senseloom::trace
