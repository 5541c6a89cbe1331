#include "activity.h"

#include <algorithm>
#include <array>
#include <cstring>

namespace senseloom::model {
namespace {

constexpr int32_t kFirstWeight = 1024;

int classOf(uint16_t item) {
  return item & 15;
}

uint16_t withClass(uint16_t item, int classId) {
  return static_cast<uint16_t>((item & ~15) | classId);
}

// Weights and their sums wrap around in 32 bits, which the conversion from 64 bits does.
int32_t sum(int32_t left, int32_t right) {
  return static_cast<int32_t>(int64_t{left} + right);
}

int32_t nextWeight(int32_t weight, int32_t weightVar) {
  return weightVar == -1 ? weight : sum(weight, weight >> (weightVar & 31));
}

std::string weightsText(size_t count, int32_t weightVar) {
  if (nextWeight(kFirstWeight, weightVar) == kFirstWeight) return "all weigh the same";
  constexpr size_t kMostShown = 8;
  std::string text = "weights";
  int32_t weight = kFirstWeight;
  for (size_t i = 0; i < count; ++i, weight = nextWeight(weight, weightVar)) {
    if (count <= kMostShown || i < kMostShown - 2 || i == count - 1) {
      text += ' ' + std::to_string(weight);
    } else if (i == kMostShown - 2) {
      text += " ...";
    }
  }
  return text;
}

}  // namespace

Verdict Activity::judge(Record record, Outcome& outcome) {
  if (!plan) {
    outcome.delivers = Outcome::sameRecord;
    return {Fate::delivered};
  }
  if (!record.empty()) {
    if (!has<int16_t>(record, kValueOffset)) return refused(Refusal::noCount);
    const auto count = at<int16_t>(record, kValueOffset);
    const size_t room = (record.size() - kItemsOffset) / 2;
    if (count > 0 && static_cast<size_t>(count) > room) {
      return refused(Refusal::itemsMissing, static_cast<size_t>(count), room);
    }
    std::copy_n(record.begin(), std::min(record.size(), work.size()), work.begin());
  }
  const auto declared = std::clamp<int>(at<int16_t>(work, kValueOffset), 0, kMostItems);
  if (declared == 0) return {Fate::noItems};
  const auto count = static_cast<size_t>(declared);
  const size_t taken = std::min(count, plan->batchSize - batch.size());
  for (size_t i = 0; i < taken; ++i) batch.push_back(at<uint16_t>(work, kItemsOffset + 2 * i));
  outcome.why.items.beyondBatch = count - taken;
  if (batch.size() == plan->batchSize) return finishBatch(outcome);
  return {Fate::batchFilling, static_cast<int32_t>(batch.size()), static_cast<int32_t>(plan->batchSize)};
}

Verdict Activity::finishBatch(Outcome& outcome) {
  std::vector<uint16_t> items = batch;
  bool hasMajority = true;
  if (plan->votes) {
    const auto winner = vote();
    hasMajority = winner.has_value();
    items = {withClass(batch.front(), winner.value_or(mistake == Mistake::noMajorityIsClass0 ? 0 : 6))};
  }
  batch.clear();
  const size_t masked = mask(items);
  if (plan->onChange) {
    const auto isReported = [&](uint16_t item) { return reported == classOf(item); };
    if (std::all_of(items.begin(), items.end(), isReported)) return {Fate::unchanged, *reported};
  }
  reported = classOf(items.back());
  outcome.why.items.withoutMajority = hasMajority ? 0 : 1;
  outcome.why.items.masked = masked;

  const auto number = static_cast<uint16_t>(items.size());
  std::memcpy(work.data() + kValueOffset, &number, sizeof number);
  std::memcpy(work.data() + kItemsOffset, items.data(), 2 * items.size());
  outcome.delivers = Outcome::ownBuffer;
  outcome.result.assign(work.begin(), work.begin() + static_cast<std::ptrdiff_t>(kItemsOffset + 2 * items.size()));
  return {Fate::delivered};
}

std::optional<int> Activity::vote() const {
  int32_t weight = kFirstWeight;
  int32_t total = 0;
  std::array<int32_t, 8> scores{};
  for (const uint16_t item : batch) {
    int32_t& score = scores[classOf(item) > 7 ? 0 : static_cast<size_t>(classOf(item))];
    score = sum(score, weight);
    total = sum(total, weight);
    weight = nextWeight(weight, plan->weightVar);
  }
  const auto winner = std::max_element(scores.begin(), scores.end());  // the first of several
  if (*winner <= total >> 1) return std::nullopt;
  return static_cast<int>(winner - scores.begin());
}

size_t Activity::mask(std::vector<uint16_t>& items) const {
  size_t masked = 0;
  for (uint16_t& item : items) {
    if (bit(plan->classMask, classOf(item))) continue;
    item = withClass(item, 0);
    ++masked;
  }
  return masked;
}

size_t Activity::restart(const Request& request, int32_t leastLogM) {
  const size_t cutOff = batch.size();
  batch.clear();
  reported.reset();
  plan = Plan{.logN = request.value("logN"),
              .leastLogM = leastLogM,
              .batchSize = size_t{1} << ((request.value("logN") - leastLogM) & 31),
              .votes = request.value("summary") != 0,
              .weightVar = request.value("weightVar"),
              .classMask = request.value("classMask"),
              .onChange = request.value("mode") == 1};
  return cutOff;
}

std::string Activity::chain() const {
  if (!plan) return "none yet: records pass as they are";
  std::string text = "batches of " + std::to_string(plan->batchSize) + " = 2^(logN " + std::to_string(plan->logN) +
                     " - merged logM " + std::to_string(plan->leastLogM) + ')';
  if (plan->votes) text += ", voted (" + weightsText(plan->batchSize, plan->weightVar) + ')';
  text += plan->classMask == -1 ? ", all classes" : ", mask " + std::to_string(plan->classMask);
  return text + (plan->onChange ? ", on change" : "");
}

}  // namespace senseloom::model
