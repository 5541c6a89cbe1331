#include "explain/activity_model.h"

#include <algorithm>

#include "trace/record_field.h"

namespace senseloom::tool {
namespace {

constexpr size_t kMostItems = 256;
constexpr size_t kVotedClasses = 8;
constexpr int kNoMajority = 6;
constexpr uint32_t kFirstWeight = 1024;

int classOf(uint16_t item) {
  return item & 15;
}

uint16_t withClass(uint16_t item, int classId) {
  return static_cast<uint16_t>((item & ~15) | classId);
}

// In 32 bits, where weights and their sums wrap around.
uint32_t nextWeight(uint32_t weight, uint32_t shift) {
  return weight + static_cast<uint32_t>(static_cast<int32_t>(weight) >> shift);
}

std::string weightsText(size_t count, uint32_t shift) {
  if (kFirstWeight >> shift == 0) return "all weigh the same";
  constexpr size_t kMostShown = 8;
  std::string text = "weights";
  uint32_t weight = kFirstWeight;
  for (size_t i = 0; i < count; ++i, weight = nextWeight(weight, shift)) {
    if (count <= kMostShown || i < kMostShown - 2 || i == count - 1) {
      text += ' ' + std::to_string(static_cast<int32_t>(weight));
    } else if (i == kMostShown - 2) {
      text += " ...";
    }
  }
  return text;
}

}  // namespace

Verdict ActivityModel::judge(const Wishes&, std::span<const uint8_t> record, const std::vector<LogLine>&) {
  if (!plan) return {Fate::delivered};
  if (!hold(record)) return {Fate::refused};
  if (held.empty()) return {Fate::noItems};
  const size_t taken = std::min(held.size(), plan->batch - batch.size());
  batch.insert(batch.end(), held.begin(), held.begin() + static_cast<std::ptrdiff_t>(taken));
  beyondBatch += held.size() - taken;
  if (batch.size() == plan->batch) return finishBatch();
  return {Fate::batchFilling, static_cast<int32_t>(batch.size()), static_cast<int32_t>(plan->batch)};
}

bool ActivityModel::hold(std::span<const uint8_t> record) {
  if (record.empty()) return true;
  const auto count = recordField<int16_t>(record, kValueOffset);
  if (!count) return false;
  const auto items = static_cast<size_t>(std::max<int16_t>(*count, 0));
  if (record.size() < kElementsOffset + 2 * items) return false;
  held.clear();
  for (size_t i = 0; i < std::min(items, kMostItems); ++i) {
    held.push_back(*recordField<uint16_t>(record, kElementsOffset + 2 * i));
  }
  return true;
}

Verdict ActivityModel::finishBatch() {
  const auto winner = plan->votes ? vote() : std::nullopt;
  Items results = batch;
  if (plan->votes) results = {withClass(batch.front(), winner.value_or(kNoMajority))};
  size_t hidden = 0;
  for (uint16_t& item : results) {
    if ((static_cast<uint32_t>(plan->mask) >> classOf(item) & 1U) != 0) continue;
    item = withClass(item, 0);
    ++hidden;
  }
  batch.clear();
  if (plan->onChange && isUnchanged(results)) return {Fate::unchanged, *reported};
  reported = classOf(results.back());
  noMajority += plan->votes && !winner ? 1 : 0;
  maskedItems += hidden;
  held = results;
  return {Fate::delivered};
}

std::optional<int> ActivityModel::vote() const {
  std::array<uint32_t, kVotedClasses> scores{};
  uint32_t total = 0;
  uint32_t weight = kFirstWeight;
  for (const uint16_t item : batch) {
    const auto classId = static_cast<size_t>(classOf(item));
    scores[classId < kVotedClasses ? classId : 0] += weight;
    total += weight;
    weight = nextWeight(weight, plan->weightShift);
  }
  const auto winner = std::max_element(scores.begin(), scores.end(), [](uint32_t left, uint32_t right) {
    return static_cast<int32_t>(left) < static_cast<int32_t>(right);
  });
  if (static_cast<int32_t>(*winner) <= static_cast<int32_t>(total) >> 1) return std::nullopt;
  return static_cast<int>(winner - scores.begin());
}

bool ActivityModel::isUnchanged(const Items& results) const {
  return reported &&
         std::all_of(results.begin(), results.end(), [this](uint16_t item) { return classOf(item) == *reported; });
}

void ActivityModel::restart(const Wishes& wishes, int32_t leastLogM) {
  lost += batch.size();
  batch.clear();
  reported.reset();
  plan = Plan{
      .batch = size_t{1} << (wishes.valueOf("logN") - leastLogM),
      .votes = wishes.valueOf("summary") != 0,
      .weightShift = static_cast<uint32_t>(wishes.valueOf("weightVar")) & 31U,
      .mask = wishes.valueOf("classMask"),
      .onChange = wishes.valueOf("mode") == 1,
  };
}

std::string ActivityModel::chain() const {
  if (!plan) return "none yet: records pass as they are";
  std::string text = "batches of " + std::to_string(plan->batch);
  if (plan->votes) text += ", voted (" + weightsText(plan->batch, plan->weightShift) + ')';
  text += plan->mask == -1 ? ", all classes" : ", mask " + std::to_string(plan->mask);
  return text + (plan->onChange ? ", on change" : "");
}

std::string ActivityModel::account() const {
  std::string text;
  const auto add = [&text](const char* what, size_t count) {
    if (count == 0) return;
    if (!text.empty()) text += ", ";
    text += what + std::to_string(count);
  };
  add("items beyond a full batch: ", beyondBatch);
  add("items lost when a negotiation cut their batch off: ", lost + batch.size());
  add("results without a majority (class 6): ", noMajority);
  add("items delivered as class 0 for the mask: ", maskedItems);
  return text;
}

}  // namespace senseloom::tool
