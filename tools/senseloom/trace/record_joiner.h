#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "trace/replayer.h"

namespace senseloom::tool {

// Tells dispatches of one record from those of the next: a record that goes to several sessions is dispatched to one
// after the other, and a recording has a line for each of them.
class RecordJoiner {
 public:
  // Whether a dispatch is the first one of a record: it is unless the same bytes went to other sessions of the sensor
  // just before.
  bool isNew(const CallOutcome& dispatch);
  // There was another call.
  void end() { sessions.clear(); }

 private:
  const Sensor* sensor = nullptr;
  std::vector<uint8_t> bytes;
  std::vector<std::string> sessions;  // that it went to; none: there is no record
};

}  // namespace senseloom::tool
