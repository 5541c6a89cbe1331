#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <map>
#include <string>
#include <utility>
#include <vector>

#include "view/packed_numbers.h"

namespace senseloom::tool {

// What a page draws where it cannot draw each record: sums over 64 records, over 64 times 64, and so on, four levels.
//
// A sum is made of cells: a lane, a key, and how often the key was there. The keys that a page knows are in
// page_data.h.
class Levels {
 public:
  static constexpr size_t kFactor = 64;
  using Cell = std::pair<uint32_t, uint32_t>;  // lane and key

  // Which keys are not added up: their greatest, or their last value counts.
  Levels(uint32_t keyOfGreatest, uint32_t keyOfLast) : greatest(keyOfGreatest), last(keyOfLast) {}

  // Adds to the record that is under way.
  void count(uint32_t lane, uint32_t key, uint32_t value);
  // Ends a record, whose time is so long after that of the one before.
  void endRecord(int64_t timeStep);
  // Ends what is incomplete.
  void end();

  // The levels from the finest on, in base64, without those that would hold one sum. For each sum: the time from the
  // one before to its first record, the number of its cells, and for each of them lane, key and value.
  std::vector<std::string> texts() const;

 private:
  struct Level {
    std::map<Cell, uint32_t> cells = {};  // of the sum that is under way
    size_t parts = 0;                     // of it
    int64_t timeStep = 0;                 // to its first record
    int64_t timePassed = 0;               // since its first record
    size_t sums = 0;
    PackedNumbers stream = {};
  };

  void endPart(size_t level, const std::map<Cell, uint32_t>& cells, int64_t timeStep);
  void endSum(size_t level);
  void join(std::map<Cell, uint32_t>& cells, const Cell& cell, uint32_t value) const;

  const uint32_t greatest;
  const uint32_t last;
  std::map<Cell, uint32_t> record;
  std::array<Level, 4> levels;
};

}  // namespace senseloom::tool
