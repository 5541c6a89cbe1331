#pragma once

#include <cstddef>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "plot/plot_lane.h"
#include "plot/timeline.h"
#include "trace/record_joiner.h"
#include "trace/replayer.h"

namespace senseloom::tool {

// Gathers what a picture of a replay shows, in memory that does not grow with the trace: for each sensor a lane with
// its records, and for each client a lane with what it received.
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
  // How many clients have no lane.
  size_t clientsLeftOut() const { return leftOut.size(); }

 private:
  void dispatch(const CallOutcome& outcome, Group& group, PlotLane* client);
  void setOption(const CallOutcome& outcome, PlotLane& client);
  Group& groupOf(const Sensor& sensor);
  PlotLane* clientOf(Group& group, const std::string& session);

  Timeline timeline;
  std::vector<Group> groups;
  size_t clients = 0;
  RecordJoiner joiner;
  uint64_t timestamp = 0;
  std::set<std::pair<const Sensor*, std::string>> leftOut;
};

}  // namespace senseloom::tool
