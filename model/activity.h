#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "bytes.h"
#include "outcome.h"
#include "reasons.h"
#include "request.h"

namespace senseloom::model {

// Mistakes that the model makes on purpose, for tests of what compares it with the library.
enum class Mistake { none, noMajorityIsClass0, closedSessionStaysMerged, optionDropsPendingItems };

// What an activity session does with records: batches, votes, masks and reports on change. Before the sensor's first
// negotiation records pass.
class Activity {
 public:
  explicit Activity(Mistake makes) : mistake(makes), work(kItemsOffset + 2 * kMostItems) {}

  Verdict judge(Record record, Outcome& outcome);

  // Starts over after a negotiation in which "logM" was merged to `leastLogM`. Returns how many items were in the
  // batch.
  size_t restart(const Request& request, int32_t leastLogM);
  size_t pending() const { return batch.size(); }
  // The stages that records go through.
  std::string chain() const;

  bool operator==(const Activity&) const = default;

 private:
  static constexpr size_t kMostItems = 256;
  struct Plan {
    int32_t logN;
    int32_t leastLogM;
    size_t batchSize;
    bool votes;
    int32_t weightVar;
    int32_t classMask;
    bool onChange;
    bool operator==(const Plan&) const = default;
  };

  Verdict finishBatch(Outcome& outcome);
  // The class with the majority of the batch's weight, if one has it.
  std::optional<int> vote() const;
  size_t mask(std::vector<uint16_t>& items) const;

  Mistake mistake;
  std::optional<Plan> plan;
  Bytes work;  // the last record or, if that was later, the last result: a record of no bytes repeats it
  std::vector<uint16_t> batch;
  std::optional<int> reported;  // class of the last item reported
};

}  // namespace senseloom::model
