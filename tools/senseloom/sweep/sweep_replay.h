#pragma once

#include <optional>
#include <string>
#include <vector>

#include "senseloom.hpp"
#include "sweep/scorer.h"
#include "sweep/sweep_script.h"

namespace senseloom::tool {

// Replays a trace to one client through the library, with one combination of its option, and scores what it receives.
//
// On a sensor that batches, a twin of the client gets the same records with the same option, but "mode" 0: it receives
// every batch, and so tells where the batches end that the client hears nothing of. It cannot change what the client
// receives: of the merged option only "logM" has an effect on a session, and the smaller of two equal values is that
// value.
class SweepReplay {
 public:
  SweepReplay(const Sensor& sensorOfClient, const std::string& optionMembers, Scorer& results)
      : sensor(sensorOfClient), members(optionMembers), scorer(results) {}

  // Leaves no session behind. Throws std::runtime_error if the client's session cannot be opened.
  void replay(const SweepScript& script);

 private:
  bool hasTwin() const { return sensor.items == Items::decisions; }
  void perform(const SweepScript& script, const SweepStep& step);
  void open(size_t client);
  bool setOption(const SweepStep& step);
  void dispatch(const SweepScript& script, const SweepStep& step);
  bool close(size_t client);

  const Sensor& sensor;
  const std::string& members;
  Scorer& scorer;
  std::vector<Session> sessions;
  Session twin;
};

}  // namespace senseloom::tool
