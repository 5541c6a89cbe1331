#include "shake_sensor.h"

#include <cstdint>

namespace hub {
namespace {

constexpr std::int32_t kSensitivity = 81;
constexpr std::int16_t kShaken = 1;

}  // namespace

void ShakeSensor::configure(Properties properties) {
  sensitivity = integerOf(properties, kSensitivity, 1);
  startOver();
}

void ShakeSensor::take(const Sample& sample, Records& records) {
  if (detector.take(sample.acceleration)) records.emplace_back(kName, sample.time).append(kShaken);
}

}  // namespace hub
