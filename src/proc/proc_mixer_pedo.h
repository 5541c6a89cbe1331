#pragma once

#include "proc/proc_mixer.h"

namespace senseloom {

// Reduces a batch of 32-bit counts to its most recent one. No session builds it.
class ProcMixerPedo final : public ProcMixer {
 public:
  explicit ProcMixerPedo(std::unique_ptr<Proc> previous) : ProcMixer(std::move(previous)) {}

 private:
  void mix() override;
};

}  // namespace senseloom
