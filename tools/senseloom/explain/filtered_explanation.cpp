#include "explain/filtered_explanation.h"

namespace senseloom::tool {

void FilteredExplanation::onCall(const ExplainedCall& call) {
  if (filter.takes(call.outcome)) output.onCall(call);
}

void FilteredExplanation::onRecord(const ExplainedRecord& record) {
  if (filter.takes(record.outcome)) output.onRecord(record);
}

void FilteredExplanation::onEnd(const std::vector<Account>& accounts) {
  std::vector<Account> taken = accounts;
  std::erase_if(taken, [this](const Account& account) { return !filter.takes(account.session, account.sensor); });
  output.onEnd(taken);
}

}  // namespace senseloom::tool
