// Activity: each batch of decisions is voted down to one, which is delivered, or only if its class is not the last one
// delivered.
#include <algorithm>
#include <array>
#include <numeric>
#include <optional>
#include <range/v3/iterator/operations.hpp>
#include <range/v3/view/chunk.hpp>
#include <range/v3/view/iota.hpp>
#include <range/v3/view/transform.hpp>

#include "contests.h"
#include "dispatch.h"

namespace bench {
namespace {

constexpr size_t kItemSize = sizeof(uint16_t);
constexpr size_t kClasses = 8;
constexpr int kNoMajority = 6;
constexpr int kGrowth = 6;  // the "weightVar" of growing weights: each record weighs 1/64 more than the one before

int classOf(int item) {
  const int id = item & 15;
  return id < static_cast<int>(kClasses) ? id : 0;
}

using Result = std::array<uint8_t, kHeaderSize + kItemSize>;

Result resultOf(const uint8_t* lastRecord, int item) {
  const int16_t count = 1;
  const auto value = static_cast<int16_t>(item);
  Result result;
  std::memcpy(result.data(), lastRecord, kTimestampSize);
  std::memcpy(result.data() + kValueOffset, &count, sizeof count);
  std::memcpy(result.data() + kHeaderSize, &value, sizeof value);
  return result;
}

template <size_t batch, bool growing>
constexpr auto weightsOf() {
  std::array<int, batch> weights;
  int weight = 1024;
  for (int& each : weights) {
    each = weight;
    if (growing) weight += weight >> kGrowth;
  }
  return weights;
}

// Adds up the scores while decisions arrive, so that it needs no batch.
template <size_t batch, bool growing, bool onChange>
class KnownVoter {
 public:
  template <class Sink>
  void operator()(const uint8_t* record, int /*size*/, Sink& sink) {
    const size_t taken = std::min(static_cast<size_t>(valueOf(record)), batch - voted);
    const auto itemAt = [&](size_t i) { return valueAt(record + kHeaderSize + i * kItemSize); };
    if (voted == 0) first = itemAt(0);
    for (size_t i = 0; i < taken; ++i) scores[static_cast<size_t>(classOf(itemAt(i)))] += kWeights[voted + i];
    voted += taken;
    if (voted == batch) decide(record, sink);
  }

 private:
  static constexpr auto kWeights = weightsOf<batch, growing>();
  static constexpr int kHalf = std::accumulate(kWeights.begin(), kWeights.end(), 0) / 2;

  template <class Sink>
  void decide(const uint8_t* record, Sink& sink) {
    int winner = kNoMajority;
    for (size_t id = 0; id < kClasses; ++id) {
      if (scores[id] > kHalf) winner = static_cast<int>(id);
      scores[id] = 0;
    }
    voted = 0;
    if (onChange && winner == last) return;
    last = winner;
    const Result result = resultOf(record, (first & ~15) | winner);
    sink(result.data(), static_cast<int>(result.size()));
  }

  std::array<int, kClasses> scores{};
  size_t voted = 0;
  int first = 0;
  int last = -1;
};

// What all others do with a complete batch.
class Decider {
 public:
  Decider(std::vector<int> weightOfEach, bool deliverChangesOnly)
      : weights(std::move(weightOfEach)), onChange(deliverChangesOnly) {}

  size_t batch() const { return weights.size(); }

  // The decision on a batch, if it is to be delivered.
  template <class Items>
  std::optional<int> operator()(const Items& items) {
    std::array<int, kClasses> scores{};
    auto weight = weights.begin();
    for (const int item : items) scores[static_cast<size_t>(classOf(item))] += *weight++;
    const auto most = std::max_element(scores.begin(), scores.end());
    const int total = std::accumulate(scores.begin(), scores.end(), 0);
    const int winner = *most > total / 2 ? static_cast<int>(most - scores.begin()) : kNoMajority;
    if (onChange && winner == last) return {};
    last = winner;
    return (*items.begin() & ~15) | winner;
  }

 private:
  std::vector<int> weights;
  bool onChange;
  std::optional<int> last;
};

class Voter {
 public:
  explicit Voter(const Decider& decider) : decide(decider) { items.reserve(decide.batch()); }

  template <class Sink>
  void operator()(const uint8_t* record, int /*size*/, Sink& sink) {
    const int offered = valueOf(record);
    for (int i = 0; i < offered && items.size() < decide.batch(); ++i) {
      items.push_back(valueAt(record + kHeaderSize + static_cast<size_t>(i) * kItemSize));
    }
    if (items.size() < decide.batch()) return;
    if (const auto item = decide(items)) {
      result = resultOf(record, *item);
      sink(result.data(), static_cast<int>(result.size()));
    }
    items.clear();
  }

 private:
  Decider decide;
  std::vector<int> items;
  Result result{};
};

// A decision and the record in which it came.
struct Origin {
  const uint8_t* record;
  size_t offset;
};

template <size_t batch, bool growing, bool onChange>
void activityContest(size_t itemsOfRecord) {
  const auto records = std::make_shared<Records>(activities(itemsOfRecord));
  const auto logOfBatch = std::to_string(std::countr_zero(batch));
  const std::string option = R"({"logN": )" + logOfBatch + R"(, "weightVar": )" +
                             std::to_string(growing ? kGrowth : -1) + R"(, "mode": )" + std::to_string(onChange) + "}";
  constexpr auto weights = weightsOf<batch, growing>();
  const Decider decider({weights.begin(), weights.end()}, onChange);
  const Order one = openingOrder(1);

  Contest contest("activity, " + std::to_string(itemsOfRecord) + (itemsOfRecord == 1 ? " item" : " items") +
                      ", batch " + std::to_string(batch) + (growing ? ", growing" : "") +
                      (onChange ? ", on change" : ""),
                  records->count());
  enterLibrary(contest, "PHYAC", option, one, records);
  contest.enter("limit", [=](auto& sink) {
    return Inlined<KnownVoter<batch, growing, onChange>, SinkOf<decltype(sink)>>({}, *records, sink);
  });
  enterCalls(contest, Voter(decider), one, records);
  contest.enter("range-v3", [=](auto& sink) {
    // What a record has beyond the room of a batch is dropped.
    return [records, &sink, decide = decider, taken = std::min(itemsOfRecord, batch)]() mutable {
      namespace views = ranges::views;
      const auto itemAt = [&](size_t position) {
        return valueAt(records->at(position / taken) + kHeaderSize + position % taken * kItemSize);
      };
      for (auto positions : views::iota(size_t{0}, records->count() * taken) | views::chunk(batch)) {
        const auto item = decide(positions | views::transform(itemAt));
        if (!item) continue;
        const auto last = *ranges::prev(ranges::end(positions));
        const Result result = resultOf(records->at(last / taken), *item);
        sink(result.data(), static_cast<int>(result.size()));
      }
    };
  });
}

template <size_t batch>
void contestsOfBatch(size_t itemsOfRecord) {
  activityContest<batch, false, false>(itemsOfRecord);
  activityContest<batch, true, false>(itemsOfRecord);
  activityContest<batch, false, true>(itemsOfRecord);
  activityContest<batch, true, true>(itemsOfRecord);
}

}  // namespace

void activityContests() {
  for (const size_t itemsOfRecord : {1U, 64U}) {
    contestsOfBatch<1>(itemsOfRecord);
    contestsOfBatch<4>(itemsOfRecord);
    contestsOfBatch<32>(itemsOfRecord);
    contestsOfBatch<256>(itemsOfRecord);
  }
}

}  // namespace bench
