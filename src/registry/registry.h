#pragma once

#include "registry/context_sensor.h"
#include "registry/session_set.h"

namespace senseloom {

// The sessions that are open, on any sensor or on none any more (see ctx_uninit()).
extern SessionSet gSessions;

// Makes the twelve sensors unless they are there. Throws std::bad_alloc, with none made.
void _init_senseloom();

// getSensor() with its type.
inline ContextSensor* findSensor(const char* name) { return static_cast<ContextSensor*>(getSensor(name)); }

}  // namespace senseloom
