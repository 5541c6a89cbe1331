// What the hub's sensors have in common.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <optional>
#include <span>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "sample.h"

namespace hub {

// Something that a sensor cannot do, as a message.
class Refused : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// One setting of a property list.
struct Property {
  std::int32_t id;
  std::span<const std::uint8_t> value;

  // The value as an integer; 0 if it is none.
  std::int32_t integer() const {
    std::int32_t number = 0;
    if (value.size() == sizeof number) std::memcpy(&number, value.data(), sizeof number);
    return number;
  }
};
using Properties = std::span<const Property>;

// The integer with this identifier, or `otherwise` if the list has none.
inline std::int32_t integerOf(Properties properties, std::int32_t id, std::int32_t otherwise) {
  for (const Property& property : properties) {
    if (property.id == id) return property.integer();
  }
  return otherwise;
}

// A record of a sensor, in the layout that the library takes.
struct Record {
  std::string_view sensor;  // its name
  std::vector<std::uint8_t> bytes;

  // The head: the timestamp, in milliseconds.
  Record(std::string_view name, std::int64_t microseconds) : sensor(name) {
    append(static_cast<std::uint64_t>(microseconds / 1000));
  }
  template <class Integer>
  void append(Integer value) {
    const std::size_t end = bytes.size();
    bytes.resize(end + sizeof value);
    std::memcpy(bytes.data() + end, &value, sizeof value);
  }
};
using Records = std::vector<Record>;

class Sensor {
 public:
  virtual ~Sensor() = default;
  // The sensor is to run with these properties from now on. Throws Refused if it cannot.
  virtual void configure(Properties properties) = 0;
  // Takes the next of the samples that are kInterval apart, and adds the records that it makes.
  virtual void take(const Sample& sample, Records& records) = 0;
  // There is a gap before the next sample; what ends with that was finished.
  virtual void startOver() = 0;
  // No more samples come for now: adds the records of what ends with that.
  virtual void finish(std::int64_t /*time*/, Records& /*records*/) {}
};

}  // namespace hub
