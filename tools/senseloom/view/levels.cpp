#include "view/levels.h"

#include <algorithm>
#include <utility>

namespace senseloom::tool {

void Levels::count(uint32_t lane, uint32_t key, uint32_t value) {
  join(record, {lane, key}, value);
}

void Levels::endRecord(int64_t timeStep) {
  endPart(0, record, timeStep);
  record.clear();
}

void Levels::end() {
  for (size_t level = 0; level < levels.size(); ++level) {
    if (levels[level].parts > 0) endSum(level);
  }
}

std::vector<std::string> Levels::texts() const {
  std::vector<std::string> result;
  for (const Level& level : levels) {
    if (level.sums > 1) result.push_back(base64(level.stream.bytes()));
  }
  return result;
}

void Levels::endPart(size_t level, const std::map<Cell, uint32_t>& cells, int64_t timeStep) {
  if (level == levels.size()) return;
  Level& here = levels[level];
  if (here.parts == 0) {
    here.timeStep = here.timePassed + timeStep;
    here.timePassed = 0;
  } else {
    here.timePassed += timeStep;
  }
  for (const auto& [cell, value] : cells) join(here.cells, cell, value);
  if (++here.parts == kFactor) endSum(level);
}

void Levels::endSum(size_t level) {
  const auto cells = std::move(levels[level].cells);
  const int64_t timeStep = levels[level].timeStep;
  levels[level].cells.clear();
  levels[level].parts = 0;
  ++levels[level].sums;
  PackedNumbers& stream = levels[level].stream;
  stream.addSigned(timeStep);
  stream.add(cells.size());
  for (const auto& [cell, value] : cells) {
    stream.add(cell.first);
    stream.add(cell.second);
    stream.add(value);
  }
  endPart(level + 1, cells, timeStep);
}

void Levels::join(std::map<Cell, uint32_t>& cells, const Cell& cell, uint32_t value) const {
  uint32_t& now = cells[cell];
  if (cell.second == last) {
    now = value;
  } else {
    now = cell.second == greatest ? std::max(now, value) : now + value;
  }
}

}  // namespace senseloom::tool
