#pragma once

#include <array>
#include <cstddef>
#include <optional>

#include "explain/session_model.h"

namespace senseloom::tool {

// Physical activity: batches, voted, masked and on change.
class ActivityModel final : public SessionModel {
 public:
  Verdict judge(const Wishes& wishes, std::span<const uint8_t> record, const std::vector<LogLine>& log) override;
  void restart(const Wishes& wishes, int32_t leastLogM) override;
  std::string chain() const override;
  std::string account() const override;

 private:
  struct Plan {
    size_t batch;  // items
    bool votes;
    uint32_t weightShift;
    int32_t mask;
    bool onChange;
  };
  using Items = std::vector<uint16_t>;

  // Puts the record's items in `held`. False when the record is refused.
  bool hold(std::span<const uint8_t> record);
  Verdict finishBatch();
  // The class with the majority of the batch's weight, if one has it.
  std::optional<int> vote() const;
  bool isUnchanged(const Items& results) const;

  std::optional<Plan> plan;  // nothing before the sensor's first negotiation: records pass
  Items held;                // the last record or, if that was later, the last result: a record of no bytes repeats it
  Items batch;
  std::optional<int> reported;  // class of the last item reported

  size_t beyondBatch = 0;  // items that found the batch full
  size_t lost = 0;         // items of batches that a negotiation cut off
  size_t noMajority = 0;   // votes
  size_t maskedItems = 0;
};

}  // namespace senseloom::tool
