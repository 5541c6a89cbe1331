#include "explain/account_table.h"

#include <algorithm>
#include <functional>
#include <string>

#include "explain/named_groups.h"
#include "terminal/text_table.h"

namespace senseloom::tool {
namespace {

constexpr size_t kFewAccounts = 20;

// A column of numbers: its title, and the number of an account.
struct Column {
  std::string title;
  std::function<size_t(const Account&)> count;
};

std::vector<Column> columnsOf(const std::vector<Account>& accounts) {
  std::vector<Column> columns{{"records", &Account::records}};
  const auto addUnlessEmpty = [&](const char* title, const std::function<size_t(const Account&)>& count) {
    const auto isUsed = [&count](const Account& account) { return count(account) > 0; };
    if (std::any_of(accounts.begin(), accounts.end(), isUsed)) columns.push_back({title, count});
  };
  const auto fateCount = [](model::Fate fate) {
    return [fate](const Account& account) { return account.fates[static_cast<size_t>(fate)]; };
  };
  columns.push_back({model::fateText(model::Fate::delivered), fateCount(model::Fate::delivered)});
  for (size_t i = 0; i < model::kFates; ++i) {
    const auto fate = static_cast<model::Fate>(i);
    if (fate != model::Fate::delivered) addUnlessEmpty(model::fateText(fate), fateCount(fate));
  }
  addUnlessEmpty("unexplained", [](const Account& account) { return account.unexplained; });
  return columns;
}

bool isAlike(const Account& one, const Account& other) {
  return one.sensor == other.sensor && one.fates == other.fates && one.unexplained == other.unexplained;
}

}  // namespace

void printAccounts(std::FILE* out, const std::vector<Account>& accounts, bool all) {
  if (std::none_of(accounts.begin(), accounts.end(), [](auto& account) { return account.records() > 0; })) return;
  const std::vector<Column> columns = columnsOf(accounts);
  TextRow heading{"session", "sensor"};
  for (const Column& column : columns) heading.push_back(column.title);
  std::vector<TextRow> rows{std::move(heading)};

  const bool isOneEach = all || accounts.size() <= kFewAccounts;
  const auto groups =
      groupsOf(accounts, [&](const Account& one, const Account& other) { return !isOneEach && isAlike(one, other); });
  const auto nameOf = [](const Account& account) { return account.session; };
  for (const auto& group : groups) {
    rows.push_back({namesText(group, nameOf), group.front()->sensor->name});
    for (const Column& column : columns) rows.back().push_back(std::to_string(column.count(*group.front())));
  }
  std::fputs("\nwhat became of the records\n", out);
  printTable(out, rows, 2);

  const auto sameChain = [](const Account& one, const Account& other) { return one.chain == other.chain; };
  for (const auto& group : groupsOf(accounts, sameChain)) {
    const std::string& chain = group.front()->chain;
    if (chain.empty()) continue;
    std::fprintf(out, "  last chain of %s: %s\n", namesText(group, nameOf).c_str(), chain.c_str());
  }
}

}  // namespace senseloom::tool
