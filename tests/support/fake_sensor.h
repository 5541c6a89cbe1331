#pragma once

#include <memory>

#include "session/context_sensor.h"

namespace fake {

// A sensor that has no kind.
class Sensor final : public senseloom::ContextSensor {
 public:
  std::unique_ptr<senseloom::Session> createSession() const override { return nullptr; }
};

}  // namespace fake
