#include "dead_reckoning_sensor.h"

#include <algorithm>

#include "resampler.h"
#include "rotation.h"

namespace hub {
namespace {

constexpr std::int32_t kUserHeight = 181;   // cm
constexpr std::int32_t kFloorHeight = 182;  // cm
constexpr std::int32_t kInitX = 183;        // cm
constexpr std::int32_t kInitY = 184;
constexpr std::int32_t kInitFloor = 185;
constexpr std::int32_t kSixAxes = 187;

// The values that stand for a height that no client gave, and what is taken in their place, in cm.
constexpr std::int32_t kNoUserHeight = 1'000;
constexpr std::int32_t kUsualUserHeight = 170;
constexpr std::int32_t kNoFloorHeight = 5'000;
constexpr std::int32_t kUsualFloorHeight = 300;

// A step has 0.414 of a person's height, as pedometers reckon.
constexpr std::int64_t kStepThousandths = 414;
// How much higher a place is, in mm, where the pressure is 1 Pa less: at sea level and 15 °C, by the barometric
// formula.
constexpr std::int64_t kHeightOfPascal = 83;
constexpr std::size_t kMostHeadings = 1'000;  // steps are reported 20 s later at most

std::int32_t orElse(std::int32_t value, std::int32_t notGiven, std::int32_t otherwise) {
  return value == notGiven ? otherwise : value;
}

// Rounded.
std::int32_t quotient(std::int64_t dividend, std::int64_t divisor) {
  return static_cast<std::int32_t>((2 * dividend + (dividend < 0 ? -divisor : divisor)) / (2 * divisor));
}

}  // namespace

void DeadReckoningSensor::configure(Properties properties) {
  const auto given = [&](std::int32_t id, std::int32_t notGiven, std::int32_t otherwise) {
    return orElse(integerOf(properties, id, notGiven), notGiven, otherwise);
  };
  stepLength = std::int64_t{given(kUserHeight, kNoUserHeight, kUsualUserHeight)} * 10 * kStepThousandths / 1'000;
  floorHeight = std::max<std::int64_t>(std::int64_t{given(kFloorHeight, kNoFloorHeight, kUsualFloorHeight)} * 10, 1);
  hasHeading = integerOf(properties, kSixAxes, 1) != 0;
  if (isConfigured) return;  // whoever walks does not start anew for another list
  isConfigured = true;
  x = std::int64_t{given(kInitX, kUnknown, 0)} * 10;
  y = std::int64_t{given(kInitY, kUnknown, 0)} * 10;
  firstFloor = floor = given(kInitFloor, kUnknown, 0);
}

void DeadReckoningSensor::take(const Sample& sample, Records& records) {
  turn(sample);
  if (sample.pressure) climb(*sample.pressure);
  for (const std::int64_t ago : detector.take(sample.acceleration)) {
    const std::size_t back = static_cast<std::size_t>(ago) + 1;
    const std::int64_t headingThen = back <= headings.size() ? headings[headings.size() - back] : heading;
    walk(headingThen);
    report(sample, headingThen, records);
  }
}

void DeadReckoningSensor::startOver() {
  detector = StepDetector();
  gravity = {};
  headings.clear();
}

// The vertical is where the acceleration of the last second points.
void DeadReckoningSensor::turn(const Sample& sample) {
  Axes up{};
  std::int64_t product = 0;
  for (std::size_t axis = 0; axis < up.size(); ++axis) {
    gravity[axis].add(sample.acceleration[axis]);
    up[axis] = static_cast<std::int32_t>(gravity[axis].mean());
    product += std::int64_t{up[axis]} * (*sample.rate)[axis];
  }
  const std::int64_t length = magnitude(up);
  if (length > 0) heading += product * kInterval / length;  // mrad/s times microseconds are nanoradians
  heading %= 2 * kHalfTurn;
  if (heading > kHalfTurn) heading -= 2 * kHalfTurn;
  if (heading < -kHalfTurn) heading += 2 * kHalfTurn;
  headings.push_back(heading);
  if (headings.size() > kMostHeadings) headings.pop_front();
}

void DeadReckoningSensor::climb(std::int32_t pressure) {
  pressures.add(pressure);
  if (!pressures.isFull()) return;
  if (!firstPressure) firstPressure = pressures.mean();
  const std::int64_t higher = quotient((*firstPressure - pressures.mean()) * kHeightOfPascal, floorHeight);
  floor = static_cast<std::int32_t>(firstFloor + higher);
}

void DeadReckoningSensor::walk(std::int64_t headingThen) {
  ++steps;
  distance += stepLength;
  const Direction direction = directionOf(headingThen);
  x -= stepLength * direction.sine / 1'000'000;
  y += stepLength * direction.cosine / 1'000'000;
}

void DeadReckoningSensor::report(const Sample& sample, std::int64_t headingThen, Records& records) const {
  constexpr std::int16_t kItems = 1;
  Record& record = records.emplace_back(kName, sample.time);
  record.append(kItems);
  record.append(static_cast<std::uint32_t>(sample.time / 1'000));
  record.append(hasHeading ? quotient(x, 10) : kUnknown);
  record.append(hasHeading ? quotient(y, 10) : kUnknown);
  record.append(floor);
  record.append(hasHeading ? quotient(headingThen, 1'000'000) : kUnknown);
  record.append(quotient(distance, 10));
  record.append(steps);
}

}  // namespace hub
