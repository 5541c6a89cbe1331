#pragma once

#include <cstddef>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "kinds/sensor_table.h"
#include "sweep/figures.h"
#include "sweep/sweep_grid.h"

namespace senseloom::tool {

// What came of a sweep: the figures of each combination.
struct SweepOutcome {
  const Sensor& sensor;
  const SweepGrid& grid;
  std::vector<std::string> heads;  // of the client's options, before the members of a combination; each once
  bool truthKnown;
  std::span<const Figures> figures;

  // The two figures by which combinations are compared: how often the client is bothered in vain, and how long it
  // waits.
  const FigureColumn& bother() const;
  const FigureColumn& wait() const;

  // Whether the combination is compared with others. Those are not that have values which the library replaces, that
  // lack one of the two figures, or that miss more than half of the changes: the few that they hear of say little.
  bool isCompared(size_t combination) const;

  // The option of a combination. If the client has several that differ otherwise, the combination's values alone.
  std::string option(size_t combination) const;
  // What the library does with the values of a combination, other than taking them.
  std::vector<std::string> remarks(size_t combination) const;
};

// Which combinations are printed, and in which order.
struct RowChoice {
  std::string sortedBy;  // the name of a figure: the smallest first; empty: in the order of the grid
  bool isReversed = false;
  bool isFrontOnly = false;
  std::optional<size_t> most = {};
};
std::vector<size_t> chooseRows(const SweepOutcome& outcome, const RowChoice& choice);

// Of the combinations that are compared, those that no other beats: none bothers and waits at most as much, and less of
// one. In the order of the wait, those of the same point by their results.
std::vector<size_t> frontOf(const SweepOutcome& outcome);

// Limits for a recommendation.
struct Limits {
  std::optional<double> falsePerHour = {};
  std::optional<double> delay = {};  // median, in seconds
};
// A sentence that names the best combination within the limits.
std::string recommendation(const SweepOutcome& outcome, const Limits& limits);

}  // namespace senseloom::tool
