#include <algorithm>
#include <cstring>
#include <utility>

#include "registry/negotiation.h"
#include "registry/registry.h"
#include "senseloom.h"

// The entry points. Only a failed allocation ever throws, and before all that can throw is done nothing is changed, but
// for what a session's own option takes of its string.
using namespace senseloom;

void* ctx_open_session(const char* sensorName) noexcept try {
  if (!ensureSensors() || sensorName == nullptr) return nullptr;
  // Only the first 9 characters take part in the look-up.
  char name[10] = {};
  std::strncpy(name, sensorName, sizeof name - 1);
  ContextSensor* sensor = findSensor(name);
  if (sensor == nullptr) return nullptr;

  gSessions.reserveOne();
  auto& sessions = sensor->sessions;
  if (sessions.size() == sessions.capacity()) sessions.reserve(2 * sessions.size() + 1);
  if (sessions.empty() && !sensor->onStart()) return nullptr;
  // Without memory for the session the sensor stays started, on purpose: the next attempt starts it once more.
  Session* session = sensor->createSession().release();
  gSessions.insert(session);
  sessions.push_back(session);
  return session;
} catch (...) {
  return nullptr;
}

int ctx_set_option(void* handle, int32_t /*reserved*/, const char* option, ctx_option_t** out) noexcept try {
  if (option == nullptr || handle == nullptr || out == nullptr) return -1;
  *out = nullptr;
  if (!ensureSensors()) return -1;
  Session* session = gSessions.find(handle);
  if (session == nullptr) return -1;
  ContextSensor* sensor = findSensor(session->name);
  if (sensor == nullptr) return -1;
  if (session->parseOption(option) != 0) return -1;

  negotiate(*sensor, session->ownOption().clone(), out);
  if (*out == nullptr) return -1;
  return rebuildSessions(*sensor) ? 0 : -1;
} catch (...) {
  return -1;
}

// Apart from the function below, so that what it has to keep over the call is not kept for every record.
[[gnu::noinline, gnu::cold]] static int dispatchFirst(void* handle, void* data, int len, void** out, int* outlen) {
  return _init_senseloom() ? ctx_dispatch_data(handle, data, len, out, outlen) : -1;
}

int ctx_dispatch_data(void* handle, void* data, int len, void** out, int* outlen) noexcept {
  if (data == nullptr || handle == nullptr || len < 0 || outlen == nullptr || out == nullptr) return -1;
  if (!gInited) return dispatchFirst(handle, data, len, out, outlen);
  Session* session = gSessions.find(handle);
  return session != nullptr ? session->postProcess(data, len, out, outlen) : -1;
}

int ctx_close_session(void* handle, ctx_option_t** option) noexcept try {
  if (option == nullptr || handle == nullptr) return -1;
  *option = nullptr;
  if (!ensureSensors()) return -1;
  Session* session = gSessions.find(handle);
  if (session == nullptr) return -1;
  ContextSensor* sensor = findSensor(session->name);

  // The copy that the negotiation of the others starts from is the one thing that can fail, so it comes first.
  std::unique_ptr<Option> merged;
  if (sensor != nullptr) {
    const auto& sessions = sensor->sessions;
    const auto remaining =
        std::find_if(sessions.begin(), sessions.end(), [&](auto* other) { return other != session; });
    if (remaining != sessions.end()) merged = (*remaining)->ownOption().clone();
  }

  gSessions.erase(session);
  std::unique_ptr<Session> closing(session);
  if (sensor == nullptr) return -1;
  std::erase(sensor->sessions, session);
  if (sensor->sessions.empty()) {
    closing.reset();
    return sensor->onStop() ? 0 : -1;
  }
  negotiate(*sensor, std::move(merged), option);
  return rebuildSessions(*sensor) ? 1 : -1;
} catch (...) {
  return -1;
}
