#pragma once

#include "registry/session_set.h"
#include "session/context_sensor.h"

// The sensors, the open sessions, and what the calls of a client do to them. What can fail for want of memory throws
// std::bad_alloc, with nothing changed but what is said.
namespace senseloom {

// The sessions that are open, on any sensor or, after deleteSensors(), on none.
[[gnu::visibility("hidden")]] extern constinit SessionSet gSessions;

// Whether the sensors are there.
inline constinit bool gInited = false;

// Makes the twelve sensors unless they are there.
void _init_senseloom();

// Deletes the sensors. The sessions stay open, and negotiate with nobody from then on.
void deleteSensors();

// Opens a session on a sensor; null when the sensor cannot be started. Without memory for the session the sensor stays
// started, on purpose: the next attempt starts it once more.
Session* openSession(ContextSensor& sensor);

// Closes a session. When others remain on its sensor they negotiate anew and `*out` gets the property list; when none
// does, the sensor is stopped. Returns 1 when sessions remain, 0 when the sensor was stopped, and -1, with the session
// closed, when the sensor could not be stopped or a remaining session could not start over.
int closeSession(Session& session, ctx_option_t** out);

// Gives a session its option string and negotiates. Returns 0 with the property list in `*out`; -1 when the string is
// refused or there is no list, and when a session could not start over. The option keeps what it took of its string
// when memory runs out afterwards.
int setOption(Session& session, const char* text, ctx_option_t** out);

}  // namespace senseloom
