#include "proc/proc_mixer_activity.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <numeric>
#include <ostream>

#include "bytes_of.h"
#include "proc/proc_nm.h"
#include "random_numbers.h"

namespace senseloom {
namespace {

using Records = std::vector<uint16_t>;

// A mixer on top of a batch of the given size, for one weightVar.
class Vote {
 public:
  Vote(size_t batchSize, int weightVar)
      : size(batchSize), stage(std::make_unique<ProcNM>(2, nullptr, static_cast<int>(batchSize)), weightVar) {}

  // The result for a batch. -1 when the records do not complete one.
  int of(const Records& records) {
    if (!stage.accept(records.data(), static_cast<int>(size))) return -1;
    const auto* result = stage.buffer();
    stage.reset();
    return result[0] | result[1] << 8;
  }

 private:
  size_t size;
  ProcMixerActivity stage;
};

struct HandCase {
  const char* name;
  int weightVar;
  Records records;
  int result;
};
void PrintTo(const HandCase& one, std::ostream* out) {
  *out << one.name;
}

Records filled(size_t count, uint16_t record) {
  return Records(count, record);
}
Records joined(Records head, const Records& tail) {
  head.insert(head.end(), tail.begin(), tail.end());
  return head;
}

// With weightVar 0 weights double from 1024 on. The one at position 21 is 2^31 and so the least 32-bit number; those
// behind it are 0. All 22 together are 1024 * (2^22 - 1) = 2^32 - 1024 and so -1024, whose half is -512.
const HandCase kHandCases[] = {
    {"HalfOfTheWeightIsNoMajority", -1, {0x0051, 0x0061, 0x0072, 0x0083}, 0x0056},
    {"MoreThanHalfIsOne", -1, {0x0051, 0x0061, 0x0071, 0x0083}, 0x0051},
    {"OneRecordIsItsOwnMajority", -1, {0x1234}, 0x1234},
    {"OneRecordIsItsOwnMajorityWithGrowingWeights", 0, {0x1237}, 0x1237},
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
    {"WrappedScoreLosesToClassesWithoutRecords", 0, filled(22, 0x0013), 0x0010},
    // Class 0 has -1024: of the tie of the others the lowest wins.
    {"LowestOfEqualClassesWins", 0, filled(22, 0x0010), 0x0011},
    // 2 has 2^31 - 1024, 5 the least number.
    {"WrappedWeightCountsAsNegative", 0, joined(filled(21, 0x0012), filled(1, 0x0015)), 0x0012},
    {"WeightsBehindTheWrappedOneAreZero", 0, joined(joined(filled(21, 0x0012), filled(1, 0x0015)), filled(200, 0x0014)),
     0x0012},
};

class MixerActivity : public testing::TestWithParam<HandCase> {};

TEST_P(MixerActivity, Votes) {
  const HandCase& one = GetParam();
  EXPECT_EQ(Vote(one.records.size(), one.weightVar).of(one.records), one.result);
}
INSTANTIATE_TEST_SUITE_P(ByHand, MixerActivity, testing::ValuesIn(kHandCases),
                         [](const auto& tested) { return std::string(tested.param.name); });

TEST(ActivityMixer, RefusesMoreUntilItIsReset) {
  ProcMixerActivity stage(std::make_unique<ProcNM>(2, nullptr, 1), -1);
  EXPECT_TRUE(stage.accept(bytesOf(uint16_t{0x0013}).data(), 1));
  EXPECT_FALSE(stage.accept(bytesOf(uint16_t{0x0024}).data(), 1));
  EXPECT_EQ(Bytes(stage.buffer(), stage.buffer() + 2), bytesOf(uint16_t{0x0013}));
  EXPECT_EQ(stage.bufferLength(), 1);
}

// The vote computed a second time, step by step: a table of weights, a bin for each voted class, and all classes put
// in order of their scores.
class PlainVote {
 public:
  PlainVote(size_t batchSize, int weightVar) : weights(batchSize, 1024) {
    if (weightVar == -1) return;
    for (size_t i = 0; i + 1 < weights.size(); ++i) {
      weights[i + 1] = wrapped(int64_t{weights[i]} + (weights[i] >> (weightVar % 32)));
    }
  }

  int of(const Records& records) const {
    const int sequence = static_cast<int16_t>(records[0]) >> 4;
    int32_t scores[8] = {};
    int32_t total = 0;
    for (size_t i = 0; i < weights.size(); ++i) {
      const int id = records[i] % 16;
      int32_t& score = scores[id > 7 ? 0 : id];
      score = wrapped(int64_t{score} + weights[i]);
      total = wrapped(int64_t{total} + weights[i]);
    }

    int order[8];
    std::iota(std::begin(order), std::end(order), 0);
    for (int place = 0; place < 8; ++place) {
      int best = place;
      for (int other = place + 1; other < 8; ++other) {
        if (scores[order[other]] > scores[order[best]]) best = other;
      }
      // Moves the best one up and keeps the others in their order.
      std::rotate(order + place, order + best, order + best + 1);
    }
    const int id = scores[order[0]] > total >> 1 ? order[0] : 6;
    return (sequence * 16 + id) & 0xFFFF;
  }

  bool hasWrapped() const { return *std::min_element(weights.begin(), weights.end()) <= 0; }

 private:
  static int32_t wrapped(int64_t sum) { return static_cast<int32_t>(static_cast<uint32_t>(sum)); }

  std::vector<int32_t> weights;
};

TEST(ActivityMixer, VotesEveryBatchOfUpToFourAsThePlainComputationDoes) {
  for (const int weightVar : {-1, 0, 1, 2, 3, 11, 31}) {
    for (size_t size = 1; size <= 4; ++size) {
      Vote vote(size, weightVar);
      const PlainVote plain(size, weightVar);
      Records records(size);
      const uint32_t batches = 1U << (4 * size);
      for (uint32_t batch = 0; batch < batches; ++batch) {
        // The classes are the batch's hexadecimal digits. The first sequence number takes all its values, too.
        for (size_t i = 0; i < size; ++i) {
          records[i] = static_cast<uint16_t>((batch * 16 + i * 0x550) & 0xFFF0) | (batch >> (4 * i) & 0xF);
        }
        if (vote.of(records) != plain.of(records)) {
          FAIL() << "weightVar " << weightVar << ": " << testing::PrintToString(records) << " gives "
                 << vote.of(records) << ", not " << plain.of(records);
        }
      }
    }
  }
}

TEST(ActivityMixer, VotesRandomBatchesAsThePlainComputationDoes) {
  RandomNumbers random;
  int wrapped = 0;
  int withoutMajority = 0;
  constexpr int kBatches = 20000;
  for (int batch = 0; batch < kBatches; ++batch) {
    const int weightVar = static_cast<int>(random.below(42)) - 1;
    Records records(1 + random.below(256));
    const uint32_t favourite = random.below(16);
    const uint32_t share = random.below(5);  // of four records, those of the favourite class
    for (auto& record : records) {
      const uint32_t any = random.next();
      record = static_cast<uint16_t>(any % 4 < share ? (any >> 8 & 0xFFF0) | favourite : any >> 8);
    }
    const PlainVote plain(records.size(), weightVar);
    const int expected = plain.of(records);
    const int voted = Vote(records.size(), weightVar).of(records);
    if (voted != expected) {
      FAIL() << "batch " << batch << ", weightVar " << weightVar << ": " << testing::PrintToString(records) << " gives "
             << voted << ", not " << expected;
    }
    wrapped += plain.hasWrapped();
    withoutMajority += expected % 16 == 6;
  }
  // Every side of the vote was taken.
  EXPECT_GT(wrapped, 0);
  EXPECT_GT(withoutMajority, kBatches / 20);
  EXPECT_GT(kBatches - withoutMajority, kBatches / 20);
}

}  // namespace
}  // namespace senseloom
