#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "explain/account.h"
#include "model/outcome.h"
#include "trace/replayer.h"

// What is explained, for those who print it.
namespace senseloom::tool {

// One thing that is told of a call.
struct Told {
  enum About {
    remark,       // something that a client may not expect
    refusal,      // the call failed, and why
    loss,         // items that no client got
    note,         // anything else
    unexplained,  // the library did something other than was derived
    logged,       // a line that the library logged, and nothing above explains
  };
  About about;
  std::string text;
  std::string logLine = {};  // the line that the library logged about it; empty: none

  bool isProblem() const { return about != note && about != logged; }
};

// A negotiation that a call brought about.
struct ExplainedNegotiation {
  const model::Negotiation* derived;
  std::vector<std::string> names;                 // of the participants
  size_t caller;                                  // the participant that made the call; none: their number
  const std::vector<model::MergedKey>* before;    // the keys as they were merged last; null: this is the first time
  const std::optional<PropertyList>* properties;  // that the library returned
  std::vector<size_t> restarted;                  // participants whose chain of stages is another than before

  bool hasManySessions() const { return names.size() > 4; }
  // Whether something is merged to another value than before.
  bool isChange() const { return !keysToShow(false).empty(); }
  // All keys, or those alone that are merged to another value than before.
  std::vector<size_t> keysToShow(bool whole) const;
  // All participants, or the one that made the call and the first ones that decided these keys.
  std::vector<size_t> sessionsToShow(const std::vector<size_t>& keys, bool whole) const;
};

// A call other than the dispatch of a record.
struct ExplainedCall {
  const CallOutcome& outcome;
  std::string what;        // it does, as in "sets {}"
  std::vector<Told> told;  // before the negotiation
  std::optional<ExplainedNegotiation> negotiation = std::nullopt;
  std::vector<Told> toldAfter = {};

  bool isProblem() const;
};

// What became of a record.
struct ExplainedRecord {
  const CallOutcome& outcome;
  model::Verdict verdict;
  std::string unexplained = {};  // what the library did otherwise; empty: nothing

  bool isProblem() const;
};

class ExplanationOutput {
 public:
  virtual ~ExplanationOutput() = default;
  virtual void onCall(const ExplainedCall& call) = 0;
  virtual void onRecord(const ExplainedRecord& record) = 0;
  // The trace is at its end: what became of all records.
  virtual void onEnd(const std::vector<Account>& accounts) = 0;
};

// How much of it is printed.
struct ExplanationExtent {
  bool records = false;   // each record
  bool all = false;       // what does not differ from before, too
  bool problems = false;  // nothing but rejections, refusals, losses and what is unexplained
};

}  // namespace senseloom::tool
