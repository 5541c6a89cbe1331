#include "hub.h"

#include <algorithm>
#include <iterator>

#include "activity_sensors.h"
#include "dead_reckoning_sensor.h"
#include "drawing_sensor.h"
#include "shake_sensor.h"
#include "step_sensor.h"
#include "template_sensor.h"

namespace hub {
namespace {

using Make = std::unique_ptr<Sensor>();

template <class SomeSensor>
std::unique_ptr<Sensor> make() {
  return std::make_unique<SomeSensor>();
}

// A row a sensor that it can sense.
struct SensorRow {
  std::string_view name;
  Make* make;
  Hub::Needs needs;
};
constexpr SensorRow kSensors[] = {
    {ActivitySensor::kName, make<ActivitySensor>, {.rate = false}},
    {InstantActivitySensor::kName, make<InstantActivitySensor>, {.rate = false}},
    {StepSensor::kName, make<StepSensor>, {.rate = false}},
    {ShakeSensor::kName, make<ShakeSensor>, {.rate = false}},
    {DrawingSensor::kName, make<DrawingSensor>, {.rate = true}},
    {TemplateSensor::kName, make<TemplateSensor>, {.rate = true}},
    {DeadReckoningSensor::kName, make<DeadReckoningSensor>, {.rate = true}},
};

// A row a sensor that it cannot.
struct RefusedRow {
  std::string_view name;
  const char* reason;
};
constexpr RefusedRow kRefused[] = {
    {"STAP", "taps last a few milliseconds, less than lies between two samples"},
    {"GSFLK", "no recordings of flicks are known to tell them from other movements by"},
    {"GSETH", "that a phone is at an ear takes a proximity sensor to tell"},
    {"LPE_P", "classes of sounds take a microphone"},
    {"LIFT", "a lift takes a pressure sensor, and recordings with one, to tell"},
};

const SensorRow& rowOf(std::string_view sensor) {
  const auto* const row = std::ranges::find(kSensors, sensor, &SensorRow::name);
  if (row != std::end(kSensors)) return *row;
  const auto* const refused = std::ranges::find(kRefused, sensor, &RefusedRow::name);
  const char* const reason = refused != std::end(kRefused) ? refused->reason : "it was not made for that";
  throw Refused("the hub cannot sense " + std::string(sensor) + ": " + reason);
}

}  // namespace

Hub::Needs Hub::needsOf(std::string_view sensor) {
  return rowOf(sensor).needs;
}

void Hub::configure(std::string_view sensor, Properties properties) {
  const SensorRow& row = rowOf(sensor);
  const auto running = sensors.find(row.name);
  if (running != sensors.end()) return running->second->configure(properties);
  auto started = row.make();
  started->configure(properties);
  sensors.emplace(row.name, std::move(started));
}

void Hub::stop(std::string_view sensor) {
  sensors.erase(sensor);
}

Records Hub::take(const Sample& sample) {
  const Resampler::Taken taken = resampler.take(sample);
  Records records;
  if (taken.startedOver) records = finish();
  time = sample.time;
  for (auto& [name, sensor] : sensors) {
    if (taken.startedOver) sensor->startOver();
    for (const Sample& interval : taken.intervals) sensor->take(interval, records);
  }
  return records;
}

Records Hub::finish() {
  Records records;
  for (auto& [name, sensor] : sensors) sensor->finish(time, records);
  return records;
}

}  // namespace hub
