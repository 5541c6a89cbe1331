#pragma once

#include <string>

#include "fake_sensor.h"

namespace fake {

// What stands in for the registry behind getSensor(): at most one sensor.
struct Registry {
  std::string name;  // of the sensor
  Sensor* sensor = nullptr;
};
Registry& registry();

}  // namespace fake
