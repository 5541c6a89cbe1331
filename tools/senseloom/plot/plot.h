#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "plot/plot_lane.h"
#include "plot/timeline.h"
#include "trace/replayer.h"

namespace senseloom::tool {

// Gathers what a picture of a replay shows, in memory that does not grow with the trace: for each sensor a lane with
// the records, and a lane a client with what it received.
class Plot final : public ReplayObserver {
 public:
  struct Group {
    const Sensor* sensor;
    PlotLane records{""};
    std::vector<PlotLane> clients = {};
  };

  void onOutcome(const CallOutcome& outcome) override;

  const Timeline& time() const { return timeline; }
  const std::vector<Group>& sensorGroups() const { return groups; }
  // Clients were left out, for there are too many for one picture.
  bool isCut() const { return cut; }

 private:
  void dispatch(const CallOutcome& outcome, Group& group, PlotLane* client);
  void setOption(const CallOutcome& outcome, PlotLane& client);
  Group& groupOf(const Sensor& sensor);
  PlotLane* clientOf(Group& group, const std::string& session);

  Timeline timeline;
  std::vector<Group> groups;
  size_t clients = 0;
  size_t recordLine = 0;  // of the last record: one that goes to several sessions is seen several times
  uint64_t timestamp = 0;
  bool cut = false;
};

}  // namespace senseloom::tool
