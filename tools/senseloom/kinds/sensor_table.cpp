#include "kinds/sensor_table.h"

#include <algorithm>
#include <iterator>

#include "input_error.h"
#include "option/all_options.h"

namespace senseloom::tool {
namespace {

constexpr Sensor kSensors[] = {
    {.name = "PHYAC", .items = Items::decisions, .lasts = true, .noMajorityClass = 6},
    {.name = "STAP", .value = "classes", .shown = Shown::classSet},
    {.name = "GSFLK", .value = "class"},
    {.name = "SHAKI", .value = "class"},
    {.name = "ISACT", .value = "class", .valueSize = 4, .lasts = true},
    {.name = "SCOUN", .value = "steps", .valueSize = 4, .shown = Shown::amount},
    {.name = "GSPX", .value = "prx", .items = Items::samples, .resultValue = "class"},
    {.name = "DTWGS", .value = "classes", .bytesProperty = 123, .shown = Shown::classSet},
    {.name = "GSETH", .value = "class"},
    {.name = "LPE_P", .value = "class", .lasts = true},
    {.name = "PDR", .items = Items::opaque, .shown = Shown::amount},
    {.name = "LIFT", .value = "class"},
};

constexpr const Sensor* find(std::string_view name) {
  for (const Sensor& sensor : kSensors) {
    if (name == sensor.name) return &sensor;
  }
  return nullptr;
}

// A record without a named integer counts its items, each of which a result shows.
constexpr bool isComplete(const Sensor& sensor) {
  if (sensor.value != nullptr) return sensor.valueSize == 2 || sensor.valueSize == 4;
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

const Sensor& sensorNamed(const std::string& name) {
  const Sensor* sensor = find(name);
  if (sensor == nullptr) {
    throw InputError("unknown sensor \"" + name + "\": `senseloom sensors` prints those that are known");
  }
  return *sensor;
}

}  // namespace senseloom::tool
