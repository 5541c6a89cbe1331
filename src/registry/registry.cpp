#include "registry/registry.h"

#include <algorithm>
#include <array>
#include <cstring>
#include <iterator>
#include <memory>
#include <utility>

#include "option/all_options.h"
#include "registry/context_sensor_kinds.h"
#include "registry/negotiation.h"

namespace senseloom {
namespace {

struct SensorKind {
  const char* name;
  std::unique_ptr<ContextSensor> (*makeSensor)();
};
template <class SensorClass>
std::unique_ptr<ContextSensor> makeSensor() {
  return std::make_unique<SensorClass>();
}
constexpr SensorKind kSensorKinds[] = {
#define SENSOR_KIND(SensorClass, SessionClass, OptionClass, BaseClass) \
  {OptionClass::kind.sensor, makeSensor<SensorClass>},
#include "sensor_kinds.def"
#undef SENSOR_KIND
};
constexpr size_t kSensors = std::size(kSensorKinds);

// The sensors, in the order of their kinds: null before they are made for the first time. They are plain pointers,
// because those of deleted sensors stay until the next ones overwrite them.
constinit std::array<ContextSensor*, kSensors> gSensors{};

// Gives back, at the end of its life, the room for sessions that no session is in.
struct UnusedRoom {
  ContextSensor& sensor;
  ~UnusedRoom() {
    gSessions.releaseUnused();
    if (sensor.sessions.empty()) sensor.sessions.shrink_to_fit();
  }
};

}  // namespace

constinit SessionSet gSessions;

void _init_senseloom() {
  if (gInited) return;
  std::array<std::unique_ptr<ContextSensor>, kSensors> sensors;
  for (size_t i = 0; i < kSensors; ++i) sensors[i] = kSensorKinds[i].makeSensor();
  for (size_t i = 0; i < kSensors; ++i) gSensors[i] = sensors[i].release();
  gInited = true;
}

void deleteSensors() {
  if (!gInited) return;
  for (const ContextSensor* sensor : gSensors) delete sensor;
  gInited = false;
}

ContextSensor* findSensor(const char* name) noexcept {
  if (name == nullptr) return nullptr;
  for (size_t i = 0; i < kSensors; ++i) {
    const char* kind = kSensorKinds[i].name;
    if (name == kind || std::strcmp(name, kind) == 0) return gSensors[i];  // a session's name is the very same string
  }
  return nullptr;
}

Session* openSession(ContextSensor& sensor) {
  const UnusedRoom unused{sensor};
  gSessions.reserveOne();
  auto& sessions = sensor.sessions;
  if (sessions.size() == sessions.capacity()) sessions.reserve(2 * sessions.size() + 1);
  if (sessions.empty() && !sensor.onStart()) return nullptr;
  Session* session = sensor.createSession();
  gSessions.insert(session);
  sessions.push_back(session);
  return session;
}

int closeSession(Session& session, ctx_option_t** out) {
  ContextSensor& sensor = *findSensor(session.name);
  auto& sessions = sensor.sessions;
  // The copy that the negotiation of the others starts from is the one thing that can fail, so it comes first.
  std::unique_ptr<Option> merged;
  const auto first = std::find_if(sessions.begin(), sessions.end(), [&](auto* other) { return other != &session; });
  if (first != sessions.end()) merged = (*first)->option->clone();

  const UnusedRoom unused{sensor};
  gSessions.erase(&session);
  std::unique_ptr<Session> closing(&session);
  std::erase(sessions, &session);
  if (sessions.empty()) {
    closing.reset();
    return sensor.onStop() ? 0 : -1;
  }
  negotiate(sensor, std::move(merged), out);
  return rebuildSessions(sensor) ? 1 : -1;
}

int setOption(Session& session, const char* text, ctx_option_t** out) {
  if (session.parseOption(text) != 0) return -1;
  ContextSensor& sensor = *findSensor(session.name);
  negotiate(sensor, session.option->clone(), out);
  if (*out == nullptr) return -1;
  return rebuildSessions(sensor) ? 0 : -1;
}

}  // namespace senseloom
