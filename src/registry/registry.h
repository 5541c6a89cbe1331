#pragma once

#include "session/context_sensor.h"
#include "registry/session_set.h"

namespace senseloom {

// The sessions that are open, on any sensor or on none any more (see ctx_uninit()).
[[gnu::visibility("hidden")]] extern constinit SessionSet gSessions;

// Whether the sensors are there.
inline constinit bool gInited = false;

// Makes the twelve sensors. False when memory ran out, with none made.
bool _init_senseloom() noexcept;

// Makes the sensors unless they are there.
inline bool ensureSensors() noexcept {
  return gInited || _init_senseloom();
}

// getSensor() with its type.
inline ContextSensor* findSensor(const char* name) {
  return static_cast<ContextSensor*>(getSensor(name));
}

}  // namespace senseloom
