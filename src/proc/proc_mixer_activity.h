#pragma once

#include "proc/proc_mixer.h"

namespace senseloom {

// Votes a batch of activity class records down to one class by weighted majority. The first record weighs 1024, and
// each further one more than the one before it by its (1 / 2^weightVar)th part, so that recent records count more; with
// weightVar -1, as from 11 on, all weigh the same.
class ProcMixerActivity final : public ProcMixer {
 public:
  ProcMixerActivity(std::unique_ptr<Proc> previous, int weightVar)
      : ProcMixer(std::move(previous)), weightShift(static_cast<uint32_t>(weightVar) & 31U) {}

 private:
  void mix() override;
  // ... by a vote. Apart from mix(), for a batch of one to take no room for it.
  [[gnu::noinline]] void vote();

  const uint32_t weightShift;  // 31 for weightVar -1, which leaves nothing to add to a weight of 1024
};

}  // namespace senseloom
