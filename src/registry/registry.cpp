#include "registry/registry.h"

#include <array>
#include <cstring>
#include <iterator>

#include "option/option_kinds.h"
#include "registry/context_sensor_kinds.h"

namespace senseloom {
namespace {

struct SensorKind {
  const char* name;
  std::unique_ptr<ContextSensor> (*makeSensor)();
};
template <class Sensor>
std::unique_ptr<ContextSensor> makeSensor() {
  return std::make_unique<Sensor>();
}
constexpr SensorKind kSensorKinds[] = {
#define SENSOR_KIND(Kind) {Option##Kind::kind.sensor, makeSensor<ContextSensor##Kind>},
#include "sensor_kinds.def"
#undef SENSOR_KIND
};
constexpr size_t kSensors = std::size(kSensorKinds);

// The sensors, in the order of their kinds: null before the first initialisation, and plain pointers, because those of
// deleted sensors stay until the next one overwrites them.
constinit std::array<ContextSensor*, kSensors> gSensors{};

}  // namespace

constinit SessionSet gSessions;

bool _init_senseloom() noexcept try {
  std::array<std::unique_ptr<ContextSensor>, kSensors> sensors;
  for (size_t i = 0; i < kSensors; ++i) sensors[i] = kSensorKinds[i].makeSensor();
  for (size_t i = 0; i < kSensors; ++i) gSensors[i] = sensors[i].release();
  gInited = true;
  return true;
} catch (const std::bad_alloc&) {
  return false;
}

}  // namespace senseloom

void ctx_uninit() noexcept {
  using namespace senseloom;
  if (!gInited) return;
  for (const ContextSensor* sensor : gSensors) delete sensor;
  gInited = false;
}

void* getSensor(const char* name) noexcept {
  using namespace senseloom;
  if (name == nullptr) return nullptr;
  for (size_t i = 0; i < kSensors; ++i) {
    const char* kind = kSensorKinds[i].name;
    if (name == kind || std::strcmp(name, kind) == 0) return gSensors[i];  // a session's name is the very same string
  }
  return nullptr;
}
