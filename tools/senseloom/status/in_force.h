#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <string_view>

#include "kinds/sensor_table.h"
#include "trace/json.h"

namespace senseloom::tool {

// What is in force in a process, from the lines in its control memory.
class InForceNow {
 public:
  struct OpenSession {
    const Sensor* sensor;
    std::optional<std::string> option;  // the last that was accepted
  };

  explicit InForceNow(std::string_view lines);

  // By number, in opening order.
  const std::map<uint32_t, OpenSession>& sessions() const { return open; }
  // The last property list of a sensor, as text; empty if it has had none.
  std::string properties(const Sensor& sensor) const;

 private:
  void take(const Json& object);
  void takeCall(const Json& object, uint32_t session);
  void takeProperties(const Sensor& sensor, const Json& object);

  std::map<uint32_t, OpenSession> open;
  std::map<const Sensor*, std::string> lists;
};

}  // namespace senseloom::tool
