#include "proc/proc_mixer_activity.h"

#include <gtest/gtest.h>

#include <ostream>
#include <string>
#include <vector>

#include "bytes.h"
#include "bytes_of.h"
#include "proc/proc_nm.h"

namespace senseloom {
namespace {

using Decisions = std::vector<uint16_t>;

// The result for a batch of all the decisions.
int vote(const Decisions& decisions, int weightVar) {
  Bytes memory(2 * decisions.size());
  ProcMixerActivity<ProcNM<2>> stage{ActivityVote(weightVar), std::span<uint8_t>(memory)};
  EXPECT_TRUE(stage.accept(decisions.data(), static_cast<int>(decisions.size())));
  return loadU16({stage.buffer(), 2}, 0);
}

struct HandCase {
  const char* name;
  int weightVar;
  Decisions decisions;
  int result;
};
void PrintTo(const HandCase& one, std::ostream* out) {
  *out << one.name;
}

Decisions filled(size_t count, uint16_t decision) {
  return Decisions(count, decision);
}
Decisions joined(Decisions head, const Decisions& tail) {
  head.insert(head.end(), tail.begin(), tail.end());
  return head;
}

// With weightVar 0 weights double from 1024 on. The one at position 21 is 2^31 and so the least 32-bit number; those
// behind it are 0. All 22 together are 1024 * (2^22 - 1) = 2^32 - 1024 and so -1024, whose half is -512.
const HandCase kHandCases[] = {
    {"HalfOfTheWeightIsNoMajority", -1, {0x0051, 0x0061, 0x0072, 0x0083}, 0x0056},
    {"MoreThanHalfIsOne", -1, {0x0051, 0x0061, 0x0071, 0x0083}, 0x0051},
    {"OneDecisionIsItsOwnMajority", -1, {0x1234}, 0x1234},
    {"OneDecisionIsItsOwnMajorityWithGrowingWeights", 0, {0x1237}, 0x1237},
    {"ClassAboveSevenIsClassZero", -1, {0x0139}, 0x0130},
    {"AllNinesAreClassZero", 1, {0x0079, 0x0089, 0x0099, 0x00A9}, 0x0070},
    {"UnknownClassesAddUpInClassZero", -1, {0x0018, 0x002F, 0x0030, 0x0043}, 0x0010},
    {"LaterOfTwoWins", 1, {0x0052, 0x0063}, 0x0053},
    {"LaterTwoOfFourWin", 1, {0x0051, 0x0061, 0x0072, 0x0082}, 0x0052},
    {"LeaderWithoutMajorityLoses", 1, {0x0052, 0x0061, 0x0071, 0x0083}, 0x0056},
    {"NoMajorityIsSixWhateverTheScores", -1, {0x0050, 0x0067}, 0x0056},
    {"NegativeSequenceNumberIsKept", -1, {0xFFF3, 0x0003}, 0xFFF3},
    {"LeastSequenceNumberIsKept", -1, {0x8001, 0x0002}, 0x8006},
    // 1024 + 1280 = 2304 against 1600 + 2000 = 3600 of 5904
    {"QuarterGrowth", 2, {0x0011, 0x0021, 0x0035, 0x0045}, 0x0015},
    // 1024 + 1152 + 1296 = 3472 against 1458
    {"EighthGrowth", 3, {0x0011, 0x0021, 0x0031, 0x0045}, 0x0011},
    {"FromElevenOnAllWeighTheSame", 11, {0x0011, 0x0025}, 0x0016},
    {"ThirtyOneWeighsTheSame", 31, {0x0011, 0x0025}, 0x0016},
    {"TenStillGrows", 10, {0x0011, 0x0025}, 0x0015},
    {"ThirtyTwoIsZero", 32, {0x0011, 0x0021, 0x0035}, 0x0015},
    // 1023 * 1024 against 1024 * 1024
    {"DoublingLetsTheLastOutweighAllOthers", 0, joined(filled(10, 0x0021), filled(1, 0x0035)), 0x0025},
    // 3 has -1024, all others 0: the least of them leads, and 0 is more than -512.
    {"WrappedScoreLosesToClassesWithoutDecisions", 0, filled(22, 0x0013), 0x0010},
    // Class 0 has -1024: of the tie of the others the lowest wins.
    {"LowestOfEqualClassesWins", 0, filled(22, 0x0010), 0x0011},
    // 2 has 2^31 - 1024, 5 the least number.
    {"WrappedWeightCountsAsNegative", 0, joined(filled(21, 0x0012), filled(1, 0x0015)), 0x0012},
    {"WeightsBehindTheWrappedOneAreZero", 0, joined(joined(filled(21, 0x0012), filled(1, 0x0015)), filled(200, 0x0014)),
     0x0012},
};

class ActivityVoteByHand : public testing::TestWithParam<HandCase> {};

TEST_P(ActivityVoteByHand, HasItsResult) {
  const HandCase& one = GetParam();
  EXPECT_EQ(vote(one.decisions, one.weightVar), one.result);
}
INSTANTIATE_TEST_SUITE_P(Vote, ActivityVoteByHand, testing::ValuesIn(kHandCases),
                         [](const auto& tested) { return std::string(tested.param.name); });

}  // namespace
}  // namespace senseloom
