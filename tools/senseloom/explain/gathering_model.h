#pragma once

#include "explain/session_model.h"

namespace senseloom::tool {

// Dead reckoning: gathers the items of records until there are 2^N.
class GatheringModel final : public SessionModel {
 public:
  Verdict judge(const Wishes& wishes, std::span<const uint8_t> record, const std::vector<LogLine>& log) override;
  std::string account() const override;

 private:
  int32_t pending = 0;  // items
};

}  // namespace senseloom::tool
