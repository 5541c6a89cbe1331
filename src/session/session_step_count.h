#pragma once

#include "option/option_step_count.h"
#include "session/session.h"

namespace senseloom {

// Step count: every update in mode 1, only multiples of `logN` hundred steps in mode 0.
class SessionStepCount final : public SessionOf<OptionStepCount> {
 public:
  // Accepts every string, on purpose: one that cannot be read leaves the option as it was.
  int parseOption(const char* text) override;
  int postProcess(void* data, int len, void** out, int* outLen) noexcept override;
};

}  // namespace senseloom
