#pragma once

#include "option/option_step_count.h"
#include "session/session.h"

namespace senseloom {

// Step count: every update in mode 1, only multiples of `logN` hundred steps in mode 0.
class SessionStepCount final : public Session {
 public:
  SessionStepCount() : Session(OptionStepCount::kind.sensor, std::make_unique<OptionStepCount>()) {}

  // Accepts every string, on purpose: one that can not be read leaves the option as it was.
  int parseOption(const char* text) override;
  int postProcess(void* data, int len, void** out, int* outLen) noexcept override;
};

}  // namespace senseloom
