#include <cstdlib>
#include <cstring>

#include "registry/registry.h"
#include "senseloom.h"

// The C functions for sessions and sensors: they check their arguments and turn what the registry throws, which is only
// ever a failed allocation, into their failure value.
using namespace senseloom;

void* ctx_open_session(const char* sensorName) noexcept {
  try {
    _init_senseloom();
    if (sensorName == nullptr) return nullptr;
    // Only the first 9 characters take part in the look-up.
    char name[10] = {};
    std::strncpy(name, sensorName, sizeof name - 1);
    ContextSensor* sensor = findSensor(name);
    return sensor != nullptr ? openSession(*sensor) : nullptr;
  } catch (...) {
    return nullptr;
  }
}

int ctx_set_option(void* handle, int32_t /*reserved*/, const char* option, ctx_option_t** out) noexcept {
  if (option == nullptr || handle == nullptr || out == nullptr) return -1;
  *out = nullptr;
  try {
    _init_senseloom();
    Session* session = gSessions.find(handle);
    return session != nullptr ? setOption(*session, option, out) : -1;
  } catch (...) {
    return -1;
  }
}

static inline int dispatch(void* handle, void* data, int len, void** out, int* outlen) {
  Session* session = gSessions.find(handle);
  return session != nullptr ? session->postProcess(data, len, out, outlen) : -1;
}

// Out of line so that the usual way of a record saves no registers for it.
[[gnu::noinline, gnu::cold]] static int dispatchFirst(void* handle, void* data, int len, void** out, int* outlen) {
  try {
    _init_senseloom();
    return dispatch(handle, data, len, out, outlen);
  } catch (...) {
    return -1;
  }
}

int ctx_dispatch_data(void* handle, void* data, int len, void** out, int* outlen) noexcept {
  if (data == nullptr || handle == nullptr || len < 0 || outlen == nullptr || out == nullptr) return -1;
  return gInited ? dispatch(handle, data, len, out, outlen) : dispatchFirst(handle, data, len, out, outlen);
}

int ctx_close_session(void* handle, ctx_option_t** option) noexcept {
  if (option == nullptr || handle == nullptr) return -1;
  *option = nullptr;
  try {
    _init_senseloom();
    Session* session = gSessions.find(handle);
    return session != nullptr ? closeSession(*session, option) : -1;
  } catch (...) {
    return -1;
  }
}

int32_t ctx_option_release(ctx_option_t* list) noexcept {
  std::free(list);
  return 0;
}

void ctx_uninit() noexcept {
  deleteSensors();
}

void* getSensor(const char* name) noexcept {
  return findSensor(name);
}
