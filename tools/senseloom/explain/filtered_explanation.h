#pragma once

#include "explain/explanation.h"
#include "trace/call_filter.h"

namespace senseloom::tool {

// Passes on what a filter takes.
class FilteredExplanation final : public ExplanationOutput {
 public:
  FilteredExplanation(ExplanationOutput& explanations, CallFilter& callFilter)
      : output(explanations), filter(callFilter) {}
  void onCall(const ExplainedCall& call) override;
  void onRecord(const ExplainedRecord& record) override;
  void onEnd(const std::vector<Account>& accounts) override;

 private:
  ExplanationOutput& output;
  CallFilter& filter;
};

}  // namespace senseloom::tool
