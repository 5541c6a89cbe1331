#pragma once

#include <array>
#include <cstdint>
#include <memory>
#include <span>

#include "bytes.h"
#include "option/option_activity.h"
#include "proc/activity_decision.h"
#include "proc/proc_change.h"
#include "proc/proc_mask.h"
#include "proc/proc_mixer_activity.h"
#include "proc/proc_nm.h"
#include "session/session.h"

namespace senseloom {

// What a chain of activity stages knows of its elements.

// Whether the class ids are the same. A null element equals only another one.
inline bool _activity_equal_func(const void* a, const void* b) {
  if (a == nullptr || b == nullptr) return a == b;
  return ActivityDecision::at(a).classId() == ActivityDecision::at(b).classId();
}
// A class outside `mask` becomes class 0.
inline void _activity_mask_func(void* item, int mask) {
  if (item == nullptr) return;
  const auto decision = ActivityDecision::at(item);
  if (!bitAt(mask, decision.classId())) decision.withClass(0).storeAt(item);
}

// Physical activity: gathers decisions into batches and delivers each batch voted, masked and on change, as the
// session's option asks. Until the sensor's first negotiation records pass through untouched.
class SessionActivity final : public SessionOf<OptionActivity> {
 public:
  int postProcess(void* data, int len, void** out, int* outLen) noexcept override;
  int buildProc() override;

 private:
  // The vote counts unmasked classes: a winner that the client did not ask for is delivered as class 0. Change is seen
  // last, so that a client hears nothing of changes among classes that it did not ask for.
  using Batch = ProcNM<ActivityDecision::kSize>;
  using Decisions = ProcMask<Batch, _activity_mask_func>;
  using Votes = ProcMask<ProcMixerActivity<Batch>, _activity_mask_func>;
  using ChangedDecisions = ProcChange<Decisions, _activity_equal_func>;
  using ChangedVotes = ProcChange<Votes, _activity_equal_func>;

  static constexpr int kMostDecisions = 256;  // the largest batch: 1 << the largest logN

  void makeChain(std::span<uint8_t> batch);
  // Offers decisions to the chain. Returns 1 with its result, 0 when it has none.
  [[gnu::always_inline]] int offer(const uint8_t* decisions, int count, void** out, int* outLen);
  // Offers what is in `work` once more.
  [[gnu::noinline]] int repeat(void** out, int* outLen);
  // Hands out the chain's result. Out of line: most records deliver nothing.
  template <class Last>
  [[gnu::noinline]] int deliver(Last& last, void** out, int* outLen);

  // All trivial, so that one can be made in the place of another.
  union Chain {
    Decisions decisions;
    ChangedDecisions changedDecisions;
    Votes votes;
    ChangedVotes changedVotes;
    Chain() : decisions(0) {}
  };
  enum class Shape { decisions, changedDecisions, votes, changedVotes };

  Chain chain;  // of this shape, once `proc` points at it
  Shape shape = Shape::decisions;
  std::unique_ptr<uint8_t[]> memory;  // of the batch
  size_t memorySize = 0;
  std::array<uint8_t, 10 + 2 * kMostDecisions> work{};  // the last record, or the last result made of it
};

}  // namespace senseloom
