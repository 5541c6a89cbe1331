#include "reasons.h"

#include <array>
#include <cstdio>
#include <limits>
#include <utility>

namespace senseloom::model {
namespace {

struct FateRow {
  const char* text;
  const char* numbers;  // format of the verdict's two numbers
};
// In the order of the fates.
constexpr FateRow kFateRows[kFates] = {
    {"delivered", ""},
    {"batch filling", ": %d of %d items"},
    {"class not wanted", ": bits %d, mask %d"},
    {"unchanged", ": class %d as before"},
    {"step not a multiple", ": %d is not a multiple of %d"},
    {"no gesture recognised", ""},
    {"no items", ""},
    {"too short", ": ends before its class or count"},
    {"refused", ""},
};

// Formats of a refusal's two numbers, in the order of the refusals.
constexpr const char* kRefusals[] = {
    ": its session is not open",
    ": ends before its number of items",
    ": says that it has %d items",
    ": says that it has %d items, and has room for %d",
    ": with it, %d items would be gathered, where %d have room",
    ": has %d bytes, where 24 to %d are taken",
    ": says that its samples have %d bytes, and has room for %d",
};

const FateRow& fateRow(Fate fate) {
  return kFateRows[static_cast<size_t>(fate)];
}

struct CountRow {
  size_t ItemCounts::*count;
  const char* text;
  bool isLoss;
};
constexpr CountRow kCountRows[] = {
    {&ItemCounts::beyondBatch, "items beyond a full batch: ", true},
    {&ItemCounts::cutOff, "items lost when a negotiation cut their batch off: ", true},
    {&ItemCounts::withoutMajority, "results without a majority (class 6): ", false},
    {&ItemCounts::masked, "items delivered as class 0 for the mask: ", false},
    {&ItemCounts::gathered, "items gathered and not delivered: ", true},
};

std::string quoted(std::string_view text) {
  return '"' + std::string(text) + '"';
}

std::string rangeText(const Key& key) {
  const auto bound = [](int32_t value, int32_t any) { return value == any ? "" : std::to_string(value); };
  return bound(key.low, std::numeric_limits<int32_t>::min()) + ".." +
         bound(key.high, std::numeric_limits<int32_t>::max());
}

std::string outOfRangeText(const Key& key, int32_t value) {
  const std::string subject = quoted(key.name) + ' ' + std::to_string(value);
  return subject + (key.low > key.high ? " is not taken, as no value is" : " is not in " + rangeText(key));
}

}  // namespace

const char* fateText(Fate fate) {
  return fateRow(fate).text;
}

int Verdict::returned() const {
  if (fate == Fate::refused) return -1;
  return fate == Fate::delivered ? 1 : 0;
}

std::string Verdict::text() const {
  std::array<char, 96> numbers;
  const char* format = fate == Fate::refused ? kRefusals[static_cast<size_t>(refusal)] : fateRow(fate).numbers;
  std::snprintf(numbers.data(), numbers.size(), format, first, second);
  return std::string(fateText(fate)) + numbers.data();
}

Verdict refused(Refusal why, size_t first, size_t second) {
  return {Fate::refused, static_cast<int32_t>(first), static_cast<int32_t>(second), why};
}

ItemCounts& ItemCounts::operator+=(const ItemCounts& other) {
  for (const CountRow& row : kCountRows) this->*row.count += other.*row.count;
  return *this;
}

std::vector<ItemCount> ItemCounts::told() const {
  std::vector<ItemCount> told;
  for (const CountRow& row : kCountRows) {
    if (this->*row.count > 0) told.push_back({row.text + std::to_string(this->*row.count), row.isLoss});
  }
  return told;
}

Remark nullText() {
  return {"a null pointer is refused"};
}

Remark notJson(const std::string& error, bool isAccepted, std::string logged) {
  const char* outcome = isAccepted ? "accepted all the same, and the session keeps its option" : "refused";
  return {"not JSON (" + error + "): " + outcome, std::move(logged)};
}

Remark notAnObject() {
  return {"not an object, so that every key has its default"};
}

Remark givenTwice(const std::string& key) {
  return {quoted(key) + " is given more than once: the last value counts"};
}

Remark withoutEffect(const Key& key) {
  return {quoted(key.name) + " has no effect: no property shows it, and no session uses it"};
}

Remark unknownKey(const std::string& key, std::string_view nearest) {
  return {"unknown key " + quoted(key) + " has no effect: the nearest known key is " + quoted(nearest)};
}

Remark notAnInteger(const std::string& key) {
  return {quoted(key) + " is no integer and counts as not given"};
}

Remark notAString(const std::string& key) {
  return {quoted(key) + " is no string and counts as not given"};
}

Remark cutTo32Bits(const std::string& key, int64_t given, int32_t value) {
  return {quoted(key) + ' ' + std::to_string(given) + " is cut to 32 bits, " + std::to_string(value)};
}

Remark defaultLogged(const Key& key, std::string logged) {
  return {quoted(key.name) + " is not given: its default is kept, and logged as a bad value", std::move(logged)};
}

Remark outOfRange(const Key& key, const Requested& requested, std::string logged) {
  return {outOfRangeText(key, requested.asked) + ": " + std::to_string(requested.value) +
              (key.outOfRange == OutOfRange::kept ? " is kept" : " is used"),
          std::move(logged)};
}

Remark maskEmptied() {
  return {"the bad \"level\" sets \"classMask\" to 0: no tap is delivered"};
}

Remark logMCut(int32_t value) {
  return {"\"logM\" is cut to \"logN\", " + std::to_string(value)};
}

Remark refusedMode(std::string logged) {
  return {"\"mode\" must be 1 (enroll) or 4 (match): the whole option is refused", std::move(logged)};
}

Remark refusedValue(const Key& key, int32_t value, std::string logged) {
  return {outOfRangeText(key, value) + ": the whole option is refused", std::move(logged)};
}

Remark refusedTemplate(const std::string& key, std::string logged) {
  return {quoted(key) + " is no template of at most 900 bytes: the whole option is refused", std::move(logged)};
}

Remark engineNotStarted(std::string logged) {
  return {"the platform's gesture engine does not start: no gesture may be recognised", std::move(logged)};
}

Remark audioNotSwitched(const char* cause, std::string logged) {
  return {std::string("the platform's audio session cannot be switched ") + cause, std::move(logged)};
}

Remark severalEnroll(std::string logged) {
  return {"no property list: several sessions enroll, and one can at a time", std::move(logged)};
}

Remark incompatibleMode(int32_t mode, std::string logged) {
  return {
      std::string("no property list: ") + (mode == 0 ? "no session has a mode" : "none can match while one enrolls"),
      std::move(logged)};
}

std::string MergedKey::deciders(const std::vector<std::string>& names) const {
  if (otherwise != nullptr) return otherwise;
  if (decidedBy.size() > 1 && decidedBy.size() == names.size()) return "all";
  std::string text;
  for (const size_t participant : decidedBy) text += (text.empty() ? "" : ", ") + names[participant];
  return text;
}

const char* ruleText(Rule rule) {
  // In the order of the rules.
  constexpr const char* kTexts[] = {"bitwise or",
                                    "minimum",
                                    "maximum",
                                    "1 when all are 1",
                                    "1 when any is not 0",
                                    "the one that started the merge",
                                    "the last one opened"};
  return kTexts[static_cast<size_t>(rule)];
}

}  // namespace senseloom::model
