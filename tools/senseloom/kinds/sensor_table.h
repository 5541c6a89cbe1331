#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace senseloom::tool {

// What the items of a record are.
enum class Items : uint8_t {
  none,
  decisions,  // 2 bytes: a class in the low 4 bits, a signed sequence number in the 12 bits above
  samples,    // 12 bytes: six integers; a result does not repeat them, since its client made them
  opaque,     // 28 bytes, whose meaning only their producer knows
};

// What a picture shows of a record.
enum class Shown : uint8_t {
  classes,   // its class or classes, as a colour each
  classSet,  // the set of its classes, as one colour
  amount,    // its integer, as a height
};

// What the tool has to know of a sensor beyond the keys of its options: one row a sensor.
//
// A record is a 64-bit timestamp and a signed integer, and items behind that, where it has any. If the integer has no
// name, it is the number of items. If it has one, 16 bits with the length of the items in bytes follow it.
struct Sensor {
  const char* name;

  // Its records, by the names that traces have for their fields.
  const char* value = nullptr;  // the integer
  size_t valueSize = 2;         // bytes of the integer: 2 or 4
  Items items = Items::none;
  const char* resultValue = nullptr;  // the integer of a result, if that is something else than the record's

  // What they mean, for people.
  const char* valueMeans = nullptr;
  const char* itemsMean = nullptr;
  const char* resultValueMeans = nullptr;
  std::string_view classNames = {};  // a letter each, from class 0 on, where the library itself names its classes

  // Its properties: the id of the one whose value is bytes; all others are 32-bit integers.
  int32_t bytesProperty = -1;

  // Its picture.
  Shown shown = Shown::classes;
  bool lasts = false;            // a class holds until the next record
  int32_t noMajorityClass = -1;  // the class that the library makes itself, for want of a majority
};

// What the timestamp of every record means, for people.
inline constexpr char kTimestampMeans[] =
    "any number, such as a time in any unit: it is copied or compared, and never interpreted";

// Whether its results have classes.
constexpr bool hasClasses(const Sensor& sensor) {
  return sensor.shown != Shown::amount;
}

// Null if there is no such sensor.
const Sensor* findSensor(std::string_view name);
// The sensor whose name is most like this one.
std::string nearestSensor(const std::string& name);
// Throws InputError if there is no such sensor.
const Sensor& sensorNamed(const std::string& name);

}  // namespace senseloom::tool
