#include "step_sensor.h"

namespace hub {
namespace {

constexpr std::int32_t kMode = 141;
constexpr std::int32_t kEveryCount = 1;
constexpr std::int32_t kHundred = 100;

}  // namespace

void StepSensor::configure(Properties properties) {
  every = integerOf(properties, kMode, kEveryCount) == kEveryCount ? 1 : kHundred;
}

void StepSensor::take(const Sample& sample, Records& records) {
  for (std::size_t found = detector.take(sample.acceleration).size(); found > 0; --found) {
    if (++steps % every == 0) records.emplace_back(kName, sample.time).append(steps);
  }
}

}  // namespace hub
