#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "kinds/sensor_table.h"

namespace senseloom::tool {

// The values that a sweep tries for one key.
struct SweepAxis {
  std::string key;
  std::vector<int64_t> values;

  bool operator==(const SweepAxis&) const = default;
};

// The axis that "KEY=VALUES" asks for: integers and ranges such as 0..8, between commas. Throws InputError.
SweepAxis readAxis(const std::string& text);

// All combinations of the values of some keys. A combination is its number; the last key changes fastest.
class SweepGrid {
 public:
  static constexpr size_t kMostCombinations = 1'000'000;

  // Throws InputError if there are too many combinations, or if a key is not one of the sensor's or is there twice.
  SweepGrid(const Sensor& sensor, std::vector<SweepAxis> axesOfKeys);

  const std::vector<SweepAxis>& axes() const { return keys; }
  size_t size() const { return count; }
  // One value a key.
  std::vector<int64_t> values(size_t combination) const;
  // The members of an option string: "logN":3,"mode":1
  std::string members(size_t combination) const;
  // For people: logN 3, mode 1. Keys that have one value alone are left out, unless all have.
  std::string name(size_t combination) const;

 private:
  std::vector<SweepAxis> keys;
  size_t count = 1;
};

}  // namespace senseloom::tool
