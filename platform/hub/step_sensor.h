// "SCOUN": steps since the sensor was started.
#pragma once

#include <cstdint>

#include "sensor.h"
#include "step_detector.h"

namespace hub {

// A record each step, or each hundred steps when no client asks for every count: all that clients ask for then are
// multiples of some hundreds.
class StepSensor : public Sensor {
 public:
  static constexpr char kName[] = "SCOUN";

  void configure(Properties properties) override;
  void take(const Sample& sample, Records& records) override;
  void startOver() override { detector = StepDetector(); }

 private:
  StepDetector detector;
  std::int32_t every = 1;
  std::int32_t steps = 0;
};

}  // namespace hub
