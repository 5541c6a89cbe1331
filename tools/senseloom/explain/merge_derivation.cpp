#include "explain/merge_derivation.h"

#include <algorithm>
#include <string_view>

namespace senseloom::tool {
namespace {

// Shift counts use their low 5 bits, and what leaves the 32 bits is lost.
uint32_t powerOfTwo(int32_t exponent) {
  return uint32_t{1} << (static_cast<uint32_t>(exponent) & 31U);
}

class Derivation {
 public:
  Derivation(const std::vector<Participant>& all, size_t first, bool firstIsForeign, const TemplateLengths& lengths)
      : participants(all),
        starter(first),
        starterIsForeign(firstIsForeign),
        templates(lengths),
        kind(all.at(first).wishes->kind()) {}

  MergeDerivation derive() {
    for (size_t key = 0; key < kind.keys.size(); ++key) result.keys.push_back(mergeKey(key));
    if (is("PHYAC")) mergeReportOnChange();
    result.properties.emplace();
    if (is("DTWGS")) {
      deriveTemplateGesture();
    } else {
      for (const OptionProperty& property : kind.properties) {
        const size_t key = kind.findKey(property.name);
        result.properties->push_back(
            {property.id, key < kind.keys.size() ? *result.keys[key].value : computed(property.id)});
      }
    }
    return std::move(result);
  }

 private:
  bool is(std::string_view sensor) const { return sensor == kind.sensor; }

  // Calls `visit` for each participant whose option is merged in.
  template <class Visit>
  void forEachMerged(Visit visit) const {
    for (size_t i = 0; i < participants.size(); ++i) {
      if (i != starter || !starterIsForeign) visit(participants[i]);
    }
  }

  MergedKey mergeKey(size_t key) const {
    const Merge rule = kind.keys[key].merge;
    if (is("DTWGS") && rule == Merge::keepFirst) return {std::nullopt, "not merged"};
    int32_t value = participants[starter].wishes->at(key).value;
    forEachMerged([&](const Participant& other) { value = merged(rule, value, other.wishes->at(key).value); });
    return {value, deciders(key, rule, value)};
  }

  std::string deciders(size_t key, Merge rule, int32_t value) const {
    if (rule == Merge::keepFirst) return participants[starter].name;
    if (rule == Merge::takeLast) {
      const Participant* last = &participants[starter];
      forEachMerged([&](const Participant& other) { last = &other; });
      return last->name;
    }
    const auto isValue = [&](int32_t wish) {
      if (rule == Merge::allOne) return (wish == 1) == (value == 1);
      if (rule == Merge::anySet) return (wish != 0) == (value != 0);
      return wish == value;
    };
    const auto hasBits = [](int32_t wish) { return wish != 0; };
    const std::string names = namesWith(key, isValue);
    // The bits of several sessions together may be what no single one has.
    return names.empty() ? namesWith(key, hasBits) : names;
  }

  template <class Predicate>
  std::string namesWith(size_t key, Predicate predicate) const {
    std::string names;
    size_t count = 0;
    for (const Participant& participant : participants) {
      if (!predicate(participant.wishes->at(key).value)) continue;
      names += (names.empty() ? "" : ", ") + participant.name;
      ++count;
    }
    return count > 1 && count == participants.size() ? "all" : names;
  }

  // Sessions with different spans can not share one report on change.
  void mergeReportOnChange() {
    MergedKey& mode = result.keys[0];
    const int32_t span = participants[starter].wishes->valueOf("logN");
    bool isShared = true;
    forEachMerged([&](const Participant& other) { isShared = isShared && other.wishes->valueOf("logN") == span; });
    if (mode.value == 1 && !isShared) mode = {0, "different \"logN\""};
  }

  int32_t computed(int32_t id) const {
    const auto logN = *result.keys[1].value;
    const auto logM = *result.keys[2].value;
    if (id == 44) return static_cast<int32_t>(powerOfTwo(logN)) >> logM;
    // The session that the merge begins with counts as it asked, the others as they were cut.
    int32_t largest = participants[starter].wishes->at(1).asked;
    forEachMerged([&](const Participant& other) { largest = std::max(largest, other.wishes->at(1).value); });
    return static_cast<int32_t>(powerOfTwo(largest) << 16 | powerOfTwo(logN));
  }

  void deriveTemplateGesture() {
    int enrolling = 0;
    forEachMerged([&](const Participant& other) { enrolling += other.wishes->valueOf("mode") == 1 ? 1 : 0; });
    const int32_t mode = *result.keys[0].value;
    if (enrolling > 1) {
      refuse("several sessions enroll, and one can at a time", "option invalid");
    } else if (mode == 4) {
      listTemplates();
    } else if (mode != 1) {
      refuse(mode == 0 ? "no session has a mode" : "none can match while one enrolls",
             "option mode incompatible: " + std::to_string(mode));
    }
  }

  void refuse(std::string conflict, std::string logged) {
    result.conflict = std::move(conflict);
    result.logged = std::move(logged);
    result.properties.reset();
  }

  void listTemplates() {
    const auto mask = static_cast<uint32_t>(*result.keys[1].value);
    result.properties->push_back({121, result.keys[2].value});
    for (size_t slot = 0; slot < templates.size(); ++slot) {
      if ((mask >> slot & 1U) == 0 || templates[slot] == 0) continue;
      result.properties->push_back({122, static_cast<int32_t>(slot)});
      result.properties->push_back({.id = 123, .size = templates[slot]});
    }
  }

  const std::vector<Participant>& participants;
  const size_t starter;
  const bool starterIsForeign;
  const TemplateLengths& templates;
  const OptionDescription& kind;
  MergeDerivation result;
};

}  // namespace

MergeDerivation deriveMerge(const std::vector<Participant>& participants, size_t starter, bool starterIsForeign,
                            const TemplateLengths& templates) {
  return Derivation(participants, starter, starterIsForeign, templates).derive();
}

}  // namespace senseloom::tool
