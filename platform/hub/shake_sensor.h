// "SHAKI": the phone is shaken.
#pragma once

#include "sensor.h"
#include "shake_detector.h"

namespace hub {

// A record of class 1 each shake.
class ShakeSensor : public Sensor {
 public:
  static constexpr char kName[] = "SHAKI";

  void configure(Properties properties) override;
  void take(const Sample& sample, Records& records) override;
  void startOver() override { detector = ShakeDetector(sensitivity); }

 private:
  int sensitivity = 1;
  ShakeDetector detector{sensitivity};
};

}  // namespace hub
