#pragma once

#include "session/context_sensor.h"
#include "session/session_kinds.h"

namespace senseloom {

template <class SessionKind>
class ContextSensorOf : public ContextSensor {
 public:
  std::unique_ptr<Session> createSession() const override { return std::make_unique<SessionKind>(); }
  bool onStart() override { return true; }
  bool onStop() override { return true; }
};

// Audio classification comes from the platform's audio hardware, whose aware session runs while there are clients.
template <>
inline bool ContextSensorOf<SessionAudioClassification>::onStart() {
  return audio_hal_activate();
}
template <>
inline bool ContextSensorOf<SessionAudioClassification>::onStop() {
  return audio_hal_deactivate();
}

#define SENSOR_KIND(Kind) using ContextSensor##Kind = ContextSensorOf<Session##Kind>;
#include "sensor_kinds.def"
#undef SENSOR_KIND

}  // namespace senseloom
