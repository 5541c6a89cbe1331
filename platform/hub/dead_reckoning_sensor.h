// "PDR": the way of a person who walks, step by step.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <optional>

#include "running_sums.h"
#include "sensor.h"
#include "step_detector.h"

namespace hub {

// A record each step, with one item of seven 32-bit integers:
//   0 time in ms (its low 32 bits)    4 x in cm    8 y in cm    12 floor    16 heading in mrad    20 distance in cm 24
//   steps
// The person starts in the direction of y; the heading is positive to the left of that. Steps are as long as follows
// from the person's height; the heading is the angular rate about the vertical, added up. Without six axes there is no
// heading: then it is kUnknown, and so are x and y. Floors take a pressure sensor.
class DeadReckoningSensor : public Sensor {
 public:
  static constexpr char kName[] = "PDR";
  static constexpr std::int32_t kUnknown = 32'767;  // as the library has it for what was not given

  void configure(Properties properties) override;
  void take(const Sample& sample, Records& records) override;
  void startOver() override;

 private:
  void turn(const Sample& sample);
  void climb(std::int32_t pressure);
  void walk(std::int64_t headingThen);
  void report(const Sample& sample, std::int64_t headingThen, Records& records) const;

  bool isConfigured = false;
  bool hasHeading = true;
  std::int64_t stepLength = 0;   // mm
  std::int64_t floorHeight = 0;  // mm

  StepDetector detector;
  std::array<RunningSums<50>, 3> gravity;
  std::deque<std::int64_t> headings;  // of the last intervals, the newest at the end
  RunningSums<50> pressures;
  std::optional<std::int64_t> firstPressure;

  std::int64_t heading = 0;  // nanoradians
  std::int64_t x = 0;        // mm
  std::int64_t y = 0;
  std::int64_t distance = 0;
  std::int32_t firstFloor = 0;
  std::int32_t floor = 0;
  std::int32_t steps = 0;
};

}  // namespace hub
