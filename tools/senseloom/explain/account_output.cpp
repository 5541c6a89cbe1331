#include "explain/account_output.h"

#include <algorithm>
#include <numeric>

#include "terminal/text_table.h"

namespace senseloom::tool {

size_t Account::records() const {
  return std::accumulate(fates.begin(), fates.end(), unexplained);
}

void printAccounts(std::FILE* out, const std::vector<Account>& accounts) {
  const auto any = [&accounts](auto predicate) { return std::any_of(accounts.begin(), accounts.end(), predicate); };
  if (!any([](const Account& account) { return account.records() > 0; })) return;

  std::vector<TextRow> rows(1 + accounts.size());
  rows[0] = {"session", "sensor", "records"};
  for (size_t i = 0; i < accounts.size(); ++i) {
    rows[1 + i] = {accounts[i].session, accounts[i].sensor->name, std::to_string(accounts[i].records())};
  }
  const auto addColumn = [&](const char* title, auto count) {
    rows[0].push_back(title);
    for (size_t i = 0; i < accounts.size(); ++i) rows[1 + i].push_back(std::to_string(count(accounts[i])));
  };
  for (size_t fate = 0; fate < model::kFates; ++fate) {
    const auto count = [fate](const Account& account) { return account.fates[fate]; };
    if (fate == static_cast<size_t>(model::Fate::delivered) ||
        any([&](const Account& account) { return count(account) > 0; })) {
      addColumn(model::fateText(static_cast<model::Fate>(fate)), count);
    }
  }
  const auto unexplained = [](const Account& account) { return account.unexplained; };
  if (any([&](const Account& account) { return unexplained(account) > 0; })) addColumn("unexplained", unexplained);

  std::fputs("\nwhat became of the records\n", out);
  printTable(out, rows, 2);
  for (const Account& account : accounts) {
    if (account.chain.empty()) continue;
    std::fprintf(out, "  last chain of %s: %s\n", account.session.c_str(), account.chain.c_str());
  }
}

}  // namespace senseloom::tool
