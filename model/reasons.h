#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "kinds.h"
#include "request.h"

// Why the library does what it does, for people.
namespace senseloom::model {

// --- records

// What becomes of a record at one session.
enum class Fate {
  delivered,
  batchFilling,
  classNotWanted,
  unchanged,
  notAMultiple,
  noGesture,
  noItems,
  tooShort,
  refused,
};
inline constexpr size_t kFates = 9;

const char* fateText(Fate fate);

// Why a record is refused.
enum class Refusal {
  notOpen,
  noCount,
  negativeCount,
  itemsMissing,
  tooManyItems,
  wrongSize,
  samplesMissing,
};

// A fate with the two numbers that made it so.
struct Verdict {
  Fate fate = Fate::refused;
  int32_t first = 0;
  int32_t second = 0;
  Refusal refusal = Refusal::notOpen;  // of those that are refused

  // What ctx_dispatch_data() returns for it.
  int returned() const;
  // The fate with its numbers.
  std::string text() const;
  bool operator==(const Verdict&) const = default;
};

Verdict refused(Refusal why, size_t first = 0, size_t second = 0);

// A count of items, for people.
struct ItemCount {
  std::string text;
  bool isLoss;  // no client got these items
};

// What becomes of a session's items, other than that they are delivered as they came.
struct ItemCounts {
  size_t beyondBatch = 0;      // dropped, since the batch was full
  size_t cutOff = 0;           // lost with their batch
  size_t withoutMajority = 0;  // votes
  size_t masked = 0;
  size_t gathered = 0;  // and not delivered

  ItemCounts& operator+=(const ItemCounts& other);
  // Those that are not 0.
  std::vector<ItemCount> told() const;
  bool operator==(const ItemCounts&) const = default;
};

// --- options

// Something about a call that its client may not expect, and the line that the library logs about it.
struct Remark {
  std::string text;
  std::string logged = {};  // empty: nothing
  bool operator==(const Remark&) const = default;
};

Remark nullText();
Remark notJson(const std::string& error, bool isAccepted, std::string logged);
Remark notAnObject();
Remark givenTwice(const std::string& key);
Remark withoutEffect(const Key& key);
Remark unknownKey(const std::string& key, std::string_view nearest);
Remark notAnInteger(const std::string& key);
Remark notAString(const std::string& key);
Remark cutTo32Bits(const std::string& key, int64_t given, int32_t value);
Remark defaultLogged(const Key& key, std::string logged);
Remark outOfRange(const Key& key, const Requested& requested, std::string logged);
Remark maskEmptied();
Remark logMCut(int32_t value);
Remark refusedMode(std::string logged);
Remark refusedValue(const Key& key, int32_t value, std::string logged);
Remark refusedTemplate(const std::string& key, std::string logged);
Remark severalEnroll(std::string logged);
Remark incompatibleMode(int32_t mode, std::string logged);

// --- calls

Remark engineNotStarted(std::string logged);
// Why the platform's audio session cannot be switched on or off.
Remark audioNotSwitched(const char* cause, std::string logged);

// --- negotiations

// One of the sessions whose requests are merged.
struct Participant {
  const void* handle = nullptr;
  Request request;
  // Of activity sessions that start over with this negotiation:
  std::string chain = {};  // the stages that records go through now
  size_t cutOff = 0;       // items that were in the batch
  bool operator==(const Participant&) const = default;
};

// What became of one key.
struct MergedKey {
  std::optional<int32_t> value;     // nothing: the key is not merged
  std::vector<size_t> decidedBy;    // the participants whose value it is, or
  const char* otherwise = nullptr;  // why it is nobody's
  bool operator==(const MergedKey&) const = default;

  // `names` are those of the participants.
  std::string deciders(const std::vector<std::string>& names) const;
};

// Who asked for what, and what it became.
struct Negotiation {
  std::vector<Participant> participants;  // in opening order
  std::vector<MergedKey> keys;
  std::optional<Remark> conflict;  // why there is no property list
  bool operator==(const Negotiation&) const = default;
};

const char* ruleText(Rule rule);

}  // namespace senseloom::model
