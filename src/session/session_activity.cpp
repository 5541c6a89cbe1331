#include "session/session_activity.h"

#include <algorithm>
#include <cstring>

#include "proc/activity_record.h"
#include "proc/proc_change.h"
#include "proc/proc_mask.h"
#include "proc/proc_mixer_activity.h"
#include "proc/proc_nm.h"
#include "session/context_sensor.h"  // the one look upward: for the options of the other sessions, merged
#include "session/record.h"

namespace senseloom {

bool _activity_equal_func(const void* a, const void* b) {
  if (a == nullptr || b == nullptr) return a == b;
  return ActivityRecord::at(a).classId() == ActivityRecord::at(b).classId();
}

void _activity_mask_func(void* item, int mask) {
  if (item == nullptr) return;
  const auto record = ActivityRecord::at(item);
  if (!bitAt(mask, record.classId())) record.withClass(0).storeAt(item);
}

int _activity_check_seq_func(const void* item) {
  return item == nullptr ? -1 : ActivityRecord::at(item).sequence();
}

std::unique_ptr<Proc> SessionActivity::makeChain(const ChainPlan& plan) {
  std::unique_ptr<Proc> chain =
      std::make_unique<ProcNM>(ActivityRecord::kSize, _activity_equal_func, _activity_check_seq_func, plan.batch);
  // The vote counts unmasked classes: a winner that the client did not ask for is delivered as class 0. Change is seen
  // last, so that a client hears nothing of changes among classes that it did not ask for.
  if (plan.summary != 0) chain = std::make_unique<ProcMixerActivity>(std::move(chain), plan.weightVar);
  chain = std::make_unique<ProcMask>(std::move(chain), _activity_mask_func, plan.classMask);
  if (plan.mode == 1) chain = std::make_unique<ProcChange>(std::move(chain));
  return chain;
}

int SessionActivity::buildProc() try {
  const auto* sensor = static_cast<const ContextSensor*>(getSensor(name));
  if (sensor == nullptr || sensor->mergedOption == nullptr) return -1;
  const auto& wanted = static_cast<const OptionActivity&>(*option);
  const auto& merged = static_cast<const OptionActivity&>(*sensor->mergedOption);

  const auto exponent = static_cast<uint32_t>(wanted.logN() - merged.logM()) & 31U;
  const ChainPlan wantedPlan = {
      .batch = static_cast<int>(uint32_t{1} << exponent),
      .summary = wanted.summary(),
      .weightVar = wanted.weightVar(),
      .classMask = wanted.classMask(),
      .mode = wanted.mode(),
  };
  // Most negotiations concern other sessions and leave this one's chain as it was, but for starting over.
  if (proc != nullptr && wantedPlan == plan) {
    proc->restart();
    return 0;
  }
  proc = makeChain(wantedPlan);
  plan = wantedPlan;
  return 0;
} catch (const std::bad_alloc&) {
  return -1;  // the old chain stays
}

int SessionActivity::postProcess(void* data, int len, void** out, int* outLen) noexcept {
  if (out == nullptr || data == nullptr || outLen == nullptr || len < 0) return -1;
  if (proc == nullptr) return passThrough(data, len, out, outLen);

  const auto record = recordBytes(data, len);
  const auto result = work.bytes();
  // A record of no bytes stands for the one left in `work`: the last record, or the last result made of it.
  if (!record.empty()) {
    if (record.size() < kHeaderSize) return -1;
    const int items = loadI16(record, kValueOffset);
    if (items > 0 && record.size() < kHeaderSize + ActivityRecord::kSize * static_cast<size_t>(items)) return -1;
    std::memcpy(result.data(), record.data(), kHeaderSize);
    copyBytes<ActivityRecord::kSize>(result.data() + kHeaderSize, record.data() + kHeaderSize,
                                     ActivityRecord::kSize * static_cast<size_t>(std::clamp(items, 0, kMostItems)));
  }
  const int count = std::min<int>(loadI16(result, kValueOffset), kMostItems);
  return proc->accept(result.data() + kHeaderSize, count) ? deliver(out, outLen) : 0;
}

int SessionActivity::deliver(void** out, int* outLen) {
  const auto result = work.bytes();
  Proc& last = *proc;
  const size_t delivered = static_cast<size_t>(last.bufferLength());
  const size_t bytes = delivered * ActivityRecord::kSize;
  *out = result.data();
  *outLen = static_cast<int>(kHeaderSize + bytes);
  storeU16(result, kValueOffset, static_cast<uint16_t>(delivered));
  copyBytes<ActivityRecord::kSize>(result.data() + kHeaderSize, last.buffer(), bytes);
  last.reset();
  return 1;
}

}  // namespace senseloom
