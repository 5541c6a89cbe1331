#pragma once

#include <cstddef>
#include <cstdio>
#include <string>
#include <vector>

#include "explain/explanation.h"

namespace senseloom::tool {

// Prints explanations as text: a block for each call, a line for each record, and at the end a table of what became of
// all records. Where there are many sessions, only what differs is printed unless all is wanted, so that hundreds of
// them take no more than a page.
class ExplanationText final : public ExplanationOutput {
 public:
  ExplanationText(std::FILE* stream, const ExplanationExtent& wanted) : out(stream), extent(wanted) {}
  void onCall(const ExplainedCall& call) override;
  void onRecord(const ExplainedRecord& record) override;
  void onEnd(const std::vector<Account>& accounts) override;

 private:
  // Whether the call is one of many like it, and changes nothing.
  bool isQuiet(const ExplainedCall& call) const;
  void printNegotiation(const ExplainedCall& call);
  // A block of several lines, apart from what is before it.
  void beginBlock();
  void printLine(const CallOutcome& outcome, const std::string& what);
  void printTold(const std::vector<Told>& told);
  void printQuietCalls();

  std::FILE* out;
  ExplanationExtent extent;
  bool begun = false;       // something was printed
  size_t negotiations = 0;  // so far
  size_t quietCalls = 0;    // that were not printed
  size_t firstQuietLine = 0;
  size_t lastQuietLine = 0;
};

}  // namespace senseloom::tool
