#pragma once

#include <cstdint>

#include "proc/activity_decision.h"
#include "proc/proc_mixer.h"

namespace senseloom {

// Votes a batch of activity decisions down to one class by weighted majority; the result carries the sequence number of
// the batch's first decision. That one weighs 1024, and each further one more than the one before it by its
// (1 / 2^weightVar)th part, so that recent decisions count more; with weightVar -1, as from 11 on, all weigh the same.
class ActivityVote {
 public:
  static constexpr int kMostDecisions = 256;

  ActivityVote() = default;
  explicit ActivityVote(int weightVar) : weightShift(static_cast<uint32_t>(weightVar) & 31U) {}

  template <class Previous>
  void operator()(const Previous& previous, uint8_t* result) const {
    const auto first = ActivityDecision::at(previous.buffer());
    // A batch of one needs no vote: its decision has the majority.
    const uint16_t winner =
        previous.bufferLength() == 1 ? votedClass(first.classId()) : vote(previous.buffer(), previous.bufferLength());
    first.withClass(winner).storeAt(result);
  }

 private:
  static constexpr uint16_t kVotedClasses = 8;

  // Classes that the vote does not know count as class 0.
  static uint16_t votedClass(uint16_t id) { return id < kVotedClasses ? id : 0; }
  // Out of line so that a batch of one takes no room for it.
  [[gnu::noinline]] uint16_t vote(const uint8_t* batch, int count) const;

  uint32_t weightShift = 31;  // 31 for weightVar -1, which leaves nothing to add to a weight of 1024
};

template <class Previous>
using ProcMixerActivity = ProcMixer<Previous, ActivityVote>;

}  // namespace senseloom
