#pragma once

#include <cstdio>

#include "explain/explanation.h"
#include "trace/json.h"

namespace senseloom::tool {

// What is told of a call: the member of that name below.
Json toldJson(const ExplainedCall& call);

// Prints explanations as JSON, an object a line:
//
//   for each call of which there is something to tell
//     "line"         line of the trace; null: closing a session that the trace left open
//     "call"         as in the trace
//     "session"      its name
//     "sensor"       its sensor's name
//     "option"       for set_option: the text, or null
//     "told"         an array of {"about","text","logged"}: "about" is "remark", "refusal", "loss", "note",
//     "unexplained"
//                    or "logged", and "logged" the line that the library logged about it, or null
//     "negotiation"  null, or {"sessions","keys","properties","chains"}: how many sessions took part; an array of keys
//                    with "key", "rule", "requests" (an array of "session", "value", "asked" and "isDefault"), "merged"
//                    and "before" (an integer or null) and "decidedBy", an array of names; of properties with "id",
//                    "name" and "text"; and of chains of stages that are new, with "session" and "text". Of many
//                    sessions, there are only what is merged to another value and the requests that decided it, unless
//                    all are wanted.
//
//   for each record that is wanted
//     "line", "call", "session", "sensor"
//     "fate"         what became of it, by the names of the columns of the table
//     "why"          the same with its reason
//     "unexplained"  what the library did otherwise, or null
//
//   at the end, for each session name on a sensor
//     "account", "sensor", "records", "fates" (an object of counts), "unexplained", "chain" (a text or null)
class ExplanationJson final : public ExplanationOutput {
 public:
  ExplanationJson(std::FILE* stream, const ExplanationExtent& wanted) : out(stream), extent(wanted) {}
  void onCall(const ExplainedCall& call) override;
  void onRecord(const ExplainedRecord& record) override;
  void onEnd(const std::vector<Account>& accounts) override;

 private:
  std::FILE* out;
  ExplanationExtent extent;
};

}  // namespace senseloom::tool
