#include "merging.h"

#include <algorithm>
#include <string>
#include <string_view>
#include <utility>

#include "bytes.h"

namespace senseloom::model {
namespace {

constexpr int32_t kEnroll = 1;
constexpr int32_t kMatch = 4;

int32_t mergedValue(Rule rule, int32_t mine, int32_t other) {
  if (rule == Rule::bitOr) return mine | other;
  if (rule == Rule::minimum) return std::min(mine, other);
  if (rule == Rule::maximum) return std::max(mine, other);
  if (rule == Rule::allOne) return mine == 1 && other == 1 ? 1 : 0;
  if (rule == Rule::anySet) return mine != 0 || other != 0 ? 1 : 0;
  return rule == Rule::takeLast ? other : mine;
}

Property property(int32_t id, int32_t value) {
  return {id, std::string(reinterpret_cast<const char*>(&value), sizeof value)};
}

// The participants whose value satisfies the predicate.
template <class Predicate>
std::vector<size_t> participantsWith(const std::vector<Participant>& all, size_t key, Predicate predicate) {
  std::vector<size_t> found;
  for (size_t i = 0; i < all.size(); ++i) {
    if (predicate(all[i].request[key].value)) found.push_back(i);
  }
  return found;
}

// The participants whose value the merged one is.
std::vector<size_t> deciders(const std::vector<Participant>& all, size_t first, bool isFirstMerged, size_t key,
                             int32_t value) {
  const Rule rule = keyOf(all[first].request.kind(), key).merge;
  if (rule == Rule::keepFirst) return {first};
  if (rule == Rule::takeLast) {
    const size_t last = all.size() - 1;
    return {last == first && !isFirstMerged && last > 0 ? last - 1 : last};
  }
  const auto found = participantsWith(all, key, [&](int32_t one) {
    if (rule == Rule::allOne) return (one == 1) == (value == 1);
    if (rule == Rule::anySet) return (one != 0) == (value != 0);
    return one == value;
  });
  if (rule != Rule::bitOr || !found.empty()) return found;
  // The bits of several sessions together may be what no single one has.
  return participantsWith(all, key, [](int32_t one) { return one != 0; });
}

}  // namespace

Merged::Merged(const Request& first)
    : values(first), largestLogN(first.kind() == phyac ? first[keyIndex(phyac, "logN")].asked : 0) {}

void Merged::merge(const Request& other) {
  const int kind = other.kind();
  const bool isSameSpan = kind != phyac || value("logN") == other.value("logN");
  for (size_t i = 0; i < rowOf(kind).keys.size(); ++i) {
    values[i].value = mergedValue(keyOf(kind, i).merge, values[i].value, other[i].value);
  }
  if (kind == phyac) largestLogN = std::max(largestLogN, other.value("logN"));
  if (!isSameSpan) values["mode"].value = 0;  // sessions with different spans cannot share one report on change
  if (kind == dtwgs && other.value("mode") == kEnroll) ++enrolling;
}

std::optional<PropertyList> Merged::render(const Templates& templates, Log& log,
                                           std::optional<Remark>& conflict) const {
  if (values.kind() == dtwgs) {
    conflict = templateConflict(log);
    if (conflict) return std::nullopt;
    return renderTemplates(templates);
  }
  PropertyList list;
  for (const PropertyRow& row : rowOf(values.kind()).properties) {
    list.push_back(property(row.id, row.key != nullptr ? value(row.key) : computed(row.id)));
  }
  return list;
}

int32_t Merged::computed(int32_t id) const {
  const int32_t smallest = shifted(1, value("logN"));
  if (id == 44) return smallest >> value("logM");
  return shifted(shifted(1, largestLogN), 16) | smallest;
}

std::optional<Remark> Merged::templateConflict(Log& log) const {
  if (enrolling > 1) return severalEnroll(write(log, kDebug, kTag, "option invalid"));
  const int32_t mode = value("mode");
  if (mode == kEnroll || mode == kMatch) return std::nullopt;
  return incompatibleMode(mode, write(log, kDebug, kTag, "option mode incompatible: %d", mode));
}

PropertyList Merged::renderTemplates(const Templates& templates) const {
  if (value("mode") == kEnroll) return {};
  PropertyList list{property(121, value("level"))};
  for (size_t slot = 0; slot < Templates::kSlots; ++slot) {
    const size_t length = templates.length(slot);
    if (!bit(value("classMask"), static_cast<int64_t>(slot)) || length == 0) continue;
    const auto number = static_cast<int32_t>(slot);
    list.push_back(property(122, number));
    list.push_back({123, templates.bytes(slot, length), number});
  }
  return list;
}

std::vector<MergedKey> decidedKeys(const std::vector<Participant>& participants, size_t first, bool isFirstMerged,
                                   const Merged& merged) {
  const int kind = participants[first].request.kind();
  std::vector<MergedKey> keys;
  for (const Key& key : rowOf(kind).keys) {
    const int32_t value = merged.value(key.name);
    if (kind == dtwgs && key.merge == Rule::keepFirst) {
      keys.push_back({std::nullopt, {}, "not merged"});
      continue;
    }
    keys.push_back({value, deciders(participants, first, isFirstMerged, keys.size(), value)});
    // All asked for a report on change, and do not get it.
    if (kind == phyac && key.merge == Rule::allOne && keys.back().decidedBy.empty()) {
      keys.back().otherwise = "different \"logN\"";
    }
  }
  return keys;
}

}  // namespace senseloom::model
