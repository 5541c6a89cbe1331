#pragma once

#include "audio/audio_hal.h"
#include "session/context_sensor.h"
#include "session/session_activity.h"
#include "session/session_filters.h"
#include "session/session_gesture_hmm.h"
#include "session/session_pdr.h"
#include "session/session_step_count.h"

namespace senseloom {

// Audio classification comes from the platform's audio hardware, whose aware session runs while there are clients.
class AwareSensor : public ContextSensor {
 public:
  bool onStart() override { return activateAudio(); }
  bool onStop() override { return deactivateAudio(); }
};

template <class SessionClass, class Base>
class ContextSensorOf final : public Base {
 public:
  Session* createSession() const override { return new SessionClass; }
};

#define SENSOR_KIND(SensorClass, SessionClass, OptionClass, BaseClass) \
  using SensorClass = ContextSensorOf<SessionClass, BaseClass>;
#include "sensor_kinds.def"
#undef SENSOR_KIND

}  // namespace senseloom
