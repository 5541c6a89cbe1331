#pragma once

#include <array>
#include <cstddef>
#include <string>

#include "kinds/sensor_table.h"
#include "model/reasons.h"

namespace senseloom::tool {

// What became of the records of one client: of the sessions that one name had on one sensor, one after the other.
struct Account {
  std::string session;
  const Sensor* sensor;
  std::array<size_t, model::kFates> fates{};  // by fate
  size_t unexplained = 0;
  std::string chain = {};  // of stages, as it was last built; empty: none

  size_t records() const;
};

}  // namespace senseloom::tool
