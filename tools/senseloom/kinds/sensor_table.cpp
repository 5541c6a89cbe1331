#include "kinds/sensor_table.h"

#include <algorithm>
#include <iterator>
#include <vector>

#include "input_error.h"
#include "model/nearest_name.h"
#include "option/all_options.h"

namespace senseloom::tool {
namespace {

constexpr char kClassMeans[] = "a class number from 1; what it stands for is defined by whoever makes the records";
constexpr char kUnreadClassMeans[] = "not looked at: what it stands for is defined by whoever makes the records";

constexpr Sensor kSensors[] = {
    {.name = "PHYAC",
     .items = Items::decisions,
     .itemsMean = "\"class\": 6 stands for no majority in a vote, 0 also for a class not wanted, and the others are "
                  "defined by whoever makes the records; \"seq\": the number of the decision",
     .lasts = true,
     .noMajorityClass = 6},
    {.name = "STAP",
     .value = "classes",
     .valueMeans = "a set of bits; what a bit stands for is defined by whoever makes the records",
     .shown = Shown::classSet},
    {.name = "GSFLK", .value = "class", .valueMeans = kClassMeans},
    {.name = "SHAKI", .value = "class", .valueMeans = kUnreadClassMeans},
    {.name = "ISACT", .value = "class", .valueSize = 4, .valueMeans = kClassMeans, .lasts = true},
    {.name = "SCOUN", .value = "steps", .valueSize = 4, .valueMeans = "the steps so far", .shown = Shown::amount},
    {.name = "GSPX",
     .value = "prx",
     .items = Items::samples,
     .resultValue = "class",
     .valueMeans = "0: nothing is near the device; a gesture counts only then",
     .itemsMean = "six integers each, in order of time; only the platform's gesture engine interprets them",
     .resultValueMeans = "1 to 9 are these digits, 10 is the digit 0, 11 to 16 are the letters A to F",
     .classNames = "-1234567890ABCDEF"},
    {.name = "DTWGS",
     .value = "classes",
     .valueMeans = "the templates that the movement matches: bit 0 the first, bit 1 the second",
     .bytesProperty = 123,
     .shown = Shown::classSet},
    {.name = "GSETH", .value = "class", .valueMeans = kClassMeans},
    {.name = "LPE_P", .value = "class", .valueMeans = kUnreadClassMeans, .lasts = true},
    {.name = "PDR",
     .items = Items::opaque,
     .itemsMean = "28 bytes each, which are copied as they are; what they hold is defined by whoever makes the records",
     .shown = Shown::amount},
    {.name = "LIFT", .value = "class", .valueMeans = kUnreadClassMeans},
};

constexpr const Sensor* find(std::string_view name) {
  for (const Sensor& sensor : kSensors) {
    if (name == sensor.name) return &sensor;
  }
  return nullptr;
}

// A record without a named integer counts its items, each of which a result shows.
constexpr bool isComplete(const Sensor& sensor) {
  if ((sensor.items == Items::none) != (sensor.itemsMean == nullptr)) return false;
  if ((sensor.resultValue == nullptr) != (sensor.resultValueMeans == nullptr)) return false;
  if (sensor.value != nullptr) return sensor.valueMeans != nullptr && (sensor.valueSize == 2 || sensor.valueSize == 4);
  return sensor.valueSize == 2 && sensor.items != Items::none && sensor.items != Items::samples;
}
static_assert(std::all_of(std::begin(kSensors), std::end(kSensors), isComplete), "a row of kSensors lacks a field");

// Every kind of sensor that the library has is here, and no other.
#define SENSOR_KIND(SensorClass, SessionClass, OptionClass, BaseClass) \
  static_assert(find(OptionClass::kind.sensor) != nullptr, #SensorClass " has no row in kSensors");
#include "sensor_kinds.def"
#undef SENSOR_KIND
static_assert(std::size(kSensors) == std::size(kOptionDescriptions), "a row of kSensors is no sensor of the library");

}  // namespace

const Sensor* findSensor(std::string_view name) {
  return find(name);
}

std::string nearestSensor(const std::string& name) {
  std::vector<std::string_view> names;
  for (const Sensor& sensor : kSensors) names.emplace_back(sensor.name);
  return std::string(model::nearestName(name, names));
}

const Sensor& sensorNamed(const std::string& name) {
  const Sensor* sensor = find(name);
  if (sensor == nullptr) {
    throw InputError("unknown sensor \"" + name + "\": the nearest is \"" + nearestSensor(name) +
                     "\"; `senseloom sensors` prints all");
  }
  return *sensor;
}

}  // namespace senseloom::tool
