#include "proc/proc_mixer_activity.h"

#include <array>

#include "proc/activity_record.h"

namespace senseloom {
namespace {

constexpr uint32_t kFirstWeight = 1024;
constexpr size_t kClassIds = 16;
constexpr size_t kVotedClasses = 8;
constexpr uint16_t kNoMajority = 6;  // the class that stands for "no class has the majority", fixed on purpose

}  // namespace

void ProcMixerActivity::mix() {
  if (prev->bufferLength() != 1) return vote();
  // What clients get who ask for nothing else: no vote to take, it has the majority.
  const auto only = ActivityRecord::at(prev->buffer());
  only.withClass(only.classId() < kVotedClasses ? only.classId() : 0).storeAt(buffer());
}

void ProcMixerActivity::vote() {
  const uint8_t* batch = prev->buffer();
  const int count = prev->bufferLength();
  // Weights and sums wrap around in 32 bits: with weightVar 0 the weight of the 22nd record already does.
  std::array<uint32_t, kClassIds> scores{};
  uint32_t total = 0;
  uint32_t weight = kFirstWeight;
  if (weight >> weightShift == 0) {  // all weigh the same
#pragma GCC unroll 8
    for (int i = 0; i < count; ++i) scores[ActivityRecord::at(batch + i * ActivityRecord::kSize).classId()] += weight;
    total = static_cast<uint32_t>(count) * weight;
  } else {
    for (int i = 0; i < count; ++i) {
      scores[ActivityRecord::at(batch + i * ActivityRecord::kSize).classId()] += weight;
      total += weight;
      weight += static_cast<uint32_t>(static_cast<int32_t>(weight) >> weightShift);
    }
  }
  for (size_t id = kVotedClasses; id < kClassIds; ++id) scores[0] += scores[id];  // unknown classes count as class 0

  uint16_t winner = 0;  // of several with the same score, the lowest id
  for (uint16_t id = 1; id < kVotedClasses; ++id) {
    if (static_cast<int32_t>(scores[id]) > static_cast<int32_t>(scores[winner])) winner = id;
  }
  const bool majority = static_cast<int32_t>(scores[winner]) > static_cast<int32_t>(total) >> 1;
  ActivityRecord::at(batch).withClass(majority ? winner : kNoMajority).storeAt(buffer());
}

}  // namespace senseloom
