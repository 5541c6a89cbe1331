#include "explain/filtered_explanation.h"

#include <utility>

namespace senseloom::tool {
namespace {

class FilteredExplanation final : public ExplanationOutput {
 public:
  FilteredExplanation(std::unique_ptr<ExplanationOutput> explanationOutput, const FilterArguments& arguments,
                      const TraceReader& trace)
      : output(std::move(explanationOutput)), filter(arguments, trace) {}
  void onCall(const ExplainedCall& call) override {
    if (filter.takes(call.outcome)) output->onCall(call);
  }
  void onRecord(const ExplainedRecord& record) override {
    if (filter.takes(record.outcome)) output->onRecord(record);
  }
  void onEnd(const std::vector<Account>& accounts) override {
    std::vector<Account> taken = accounts;
    std::erase_if(taken, [this](const Account& account) { return !filter.takes(account.session, account.sensor); });
    output->onEnd(taken);
  }

 private:
  std::unique_ptr<ExplanationOutput> output;
  CallFilter filter;
};

}  // namespace

std::unique_ptr<ExplanationOutput> withFilter(std::unique_ptr<ExplanationOutput> output,
                                              const FilterArguments& arguments, const TraceReader& trace) {
  if (arguments.takesAll()) return output;
  return std::make_unique<FilteredExplanation>(std::move(output), arguments, trace);
}

}  // namespace senseloom::tool
