#include "proc/proc_mixer_activity.h"

#include <array>
#include <cstddef>

// clang before 13 does not know the pragma.
#if defined(__clang__) && __clang_major__ < 13
#define SENSELOOM_UNROLL
#else
#define SENSELOOM_UNROLL _Pragma("GCC unroll 8")
#endif

namespace senseloom {
namespace {

constexpr uint32_t kFirstWeight = 1024;
constexpr size_t kGrowingShifts = 11;  // a larger shift leaves nothing to add to the first weight
constexpr uint16_t kNoMajority = 6;    // the class that stands for "no class has the majority", fixed on purpose

// The weights of a batch by shift and position. They wrap around in 32 bits: with weightVar 0 the weight of the 22nd
// decision already does.
using Weights = std::array<uint32_t, ActivityVote::kMostDecisions>;
constexpr auto kWeights = [] {
  std::array<Weights, kGrowingShifts> all{};
  for (size_t shift = 0; shift < kGrowingShifts; ++shift) {
    uint32_t weight = kFirstWeight;
    for (uint32_t& place : all[shift]) {
      place = weight;
      weight += static_cast<uint32_t>(static_cast<int32_t>(weight) >> shift);
    }
  }
  return all;
}();

}  // namespace

uint16_t ActivityVote::vote(const uint8_t* batch, int count) const {
  std::array<uint32_t, ActivityDecision::kClassIds> scores{};
  const auto add = [&](int i, uint32_t weight) {
    scores[ActivityDecision::at(batch + static_cast<size_t>(i) * ActivityDecision::kSize).classId()] += weight;
  };
  const auto addUnknownClasses = [&] {
    for (size_t id = kVotedClasses; id < scores.size(); ++id) scores[0] += scores[id];
  };
  if (weightShift >= kGrowingShifts) {  // all weigh the same, so that it is enough to count
    SENSELOOM_UNROLL
    for (int i = 0; i < count; ++i) add(i, 1);
    addUnknownClasses();
    for (uint16_t id = 0; id < kVotedClasses; ++id) {
      if (2 * scores[id] > static_cast<uint32_t>(count)) return id;
    }
    return kNoMajority;
  }

  const Weights& weights = kWeights[weightShift];
  SENSELOOM_UNROLL
  for (int i = 0; i < count; ++i) add(i, weights[static_cast<size_t>(i)]);
  addUnknownClasses();
  uint16_t winner = 0;  // of several with the same score, the lowest id
  uint32_t total = scores[0];
  for (uint16_t id = 1; id < kVotedClasses; ++id) {
    total += scores[id];
    if (static_cast<int32_t>(scores[id]) > static_cast<int32_t>(scores[winner])) winner = id;
  }
  const bool hasMajority = static_cast<int32_t>(scores[winner]) > static_cast<int32_t>(total) >> 1;
  return hasMajority ? winner : kNoMajority;
}

}  // namespace senseloom
