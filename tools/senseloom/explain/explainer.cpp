#include "explain/explainer.h"

#include <algorithm>
#include <string_view>
#include <utility>

#include "explain/negotiation_output.h"
#include "explain/platform_answers.h"

namespace senseloom::tool {
namespace {

// Lines that tell that a negotiation takes place, which is no news here.
constexpr std::string_view kNegotiationTag = "Libsl";
// The platform's log cuts what is longer.
constexpr size_t kMostLogged = 1023;

// Whether the library delivered for a record what the model does.
bool isDelivered(const CallOutcome& outcome, const model::Outcome& expected) {
  if (expected.delivers == model::Outcome::nothing) return true;
  const std::span<const uint8_t> wanted =
      expected.delivers == model::Outcome::sameRecord ? outcome.record : std::span<const uint8_t>(expected.result);
  return outcome.result && std::equal(wanted.begin(), wanted.end(), outcome.result->begin(), outcome.result->end());
}

}  // namespace

void Explainer::onOutcome(const CallOutcome& outcome) {
  log = library.take();
  std::erase_if(log, [](const model::LogLine& line) { return line.tag == kNegotiationTag; });
  model.answers = answersToldBy(log);
  switch (outcome.call.kind) {
    case CallKind::open:
      open(outcome);
      break;
    case CallKind::setOption:
      setOption(outcome);
      break;
    case CallKind::dispatch:
      dispatch(outcome);
      break;
    case CallKind::close:
      close(outcome);
      break;
    case CallKind::uninit:
      model.uninit();
      break;
  }
}

void Explainer::onEnd() {
  printAccounts(out, accounts);
}

void Explainer::open(const CallOutcome& outcome) {
  Account& account = accountOf(outcome.session, outcome.sensor);
  const Session& session = sessions.emplace_back(Session{outcome.session, outcome.sensor});
  const bool isExpected = model.open(outcome.sensor->name, &session).returned == 1;
  if (!outcome.failed) {
    account.chain = model.chain(&session);
    if (!isExpected) printBlock(outcome, "unexplained: opens, where no session was derived");
    return;
  }
  printBlock(outcome, "does not open");
  if (isExpected) {
    std::fputs("  unexplained: the library opened no session, where one was derived\n", out);
    model.close(&session, true);
  }
  sessions.pop_back();
  printRestOfLog();
}

void Explainer::setOption(const CallOutcome& outcome) {
  const auto session = find(outcome.session);
  const auto& text = outcome.call.option;
  printBlock(outcome, "sets " + text.value_or("a null pointer"));
  if (session == sessions.end()) {
    std::fputs("  refused: the session did not open\n", out);
    return;
  }
  const model::Outcome expected = model.setOption(&*session, text ? text->c_str() : nullptr, true);
  printRemarks(expected.why.remarks);
  if (expected.why.negotiation) {
    noteRestarts(*expected.why.negotiation, false);
    printNegotiation(outcome, expected);
  } else {
    checkReturn(outcome, expected);
    if (outcome.failed) std::fputs("  refused: nothing changes\n", out);
  }
  printRestOfLog();
}

void Explainer::dispatch(const CallOutcome& outcome) {
  const auto session = find(outcome.session);
  model::Outcome expected;
  if (session != sessions.end()) {
    const uint8_t nothing = 0;  // a record of no bytes has an address, too
    expected = model.dispatch(&*session, outcome.record.empty() ? &nothing : outcome.record.data(),
                              static_cast<int>(outcome.record.size()), true, true);
    session->items += expected.why.items;
  }
  const model::Verdict& verdict = expected.why.verdict;
  Account& account = accountOf(outcome.session, outcome.sensor);
  if (verdict.returned() != outcome.returned) {
    ++account.unexplained;
    printLine(outcome, "unexplained: the library returned " + std::to_string(outcome.returned) +
                           ", where this was derived: " + verdict.text());
    return;
  }
  if (!isDelivered(outcome, expected)) {
    ++account.unexplained;
    printLine(outcome, "unexplained: the library delivered other bytes than were derived");
    return;
  }
  ++account.fates[static_cast<size_t>(verdict.fate)];
  if (records) printLine(outcome, verdict.text());
}

void Explainer::close(const CallOutcome& outcome) {
  const auto closing = find(outcome.session);
  // At the end of the trace sessions are closed by the tool, which is no news but for what they made of the records.
  const bool isAtEnd = outcome.call.line == 0;
  if (closing == sessions.end()) {
    if (!isAtEnd) printBlock(outcome, "leaves");
    return;
  }
  const model::Outcome expected = model.close(&*closing, true);
  closing->items += expected.why.items;
  const std::string account = closing->items.text();
  sessions.erase(closing);
  if (!isAtEnd || !account.empty() || outcome.returned != expected.returned) {
    printBlock(outcome, isAtEnd ? "is open at the end" : "leaves");
  }
  if (!account.empty()) std::fprintf(out, "  %s\n", account.c_str());
  if (expected.why.negotiation) noteRestarts(*expected.why.negotiation, isAtEnd);
  if (expected.why.negotiation && !isAtEnd) {
    printNegotiation(outcome, expected);
  } else {
    checkReturn(outcome, expected);
  }
  if (!isAtEnd) printRestOfLog();
}

void Explainer::printNegotiation(const CallOutcome& outcome, const model::Outcome& expected) {
  const model::Negotiation& negotiation = *expected.why.negotiation;
  std::vector<std::string> names;
  for (const auto& participant : negotiation.participants) {
    names.push_back(static_cast<const Session*>(participant.handle)->name);
  }
  tool::printNegotiation(out, negotiation, names, expected.list, outcome.properties);
  if (negotiation.conflict) printRemarks({*negotiation.conflict});
  checkReturn(outcome, expected);
  for (size_t i = 0; i < names.size(); ++i) {
    const std::string& chain = negotiation.participants[i].chain;
    if (!chain.empty()) std::fprintf(out, "  chain of %s: %s\n", names[i].c_str(), chain.c_str());
  }
}

void Explainer::noteRestarts(const model::Negotiation& negotiation, bool isAtEnd) {
  for (Session& session : sessions) {
    const auto restarted = std::find_if(negotiation.participants.begin(), negotiation.participants.end(),
                                        [&session](auto& participant) { return participant.handle == &session; });
    if (restarted == negotiation.participants.end() || restarted->chain.empty()) continue;
    session.items.cutOff += restarted->cutOff;
    if (!isAtEnd) accountOf(session.name, session.sensor).chain = restarted->chain;
  }
}

void Explainer::checkReturn(const CallOutcome& outcome, const model::Outcome& expected) {
  if (outcome.returned == expected.returned) return;
  std::fprintf(out, "  unexplained: the library returned %d, where %d was derived\n", outcome.returned,
               expected.returned);
}

void Explainer::printRemarks(const std::vector<model::Remark>& remarks) {
  for (const model::Remark& remark : remarks) {
    std::fprintf(out, "  %s\n", remark.text.c_str());
    if (remark.logged.empty()) continue;
    if (takeLogged(remark.logged)) {
      std::fprintf(out, "    logged: %s\n", remark.logged.c_str());
    } else {
      std::fprintf(out, "    unexplained: the library did not log: %s\n", remark.logged.c_str());
    }
  }
}

bool Explainer::takeLogged(const std::string& text) {
  const auto found = std::find_if(log.begin(), log.end(), [&text](const model::LogLine& line) {
    return line.text == text || line.text == text.substr(0, kMostLogged);
  });
  if (found == log.end()) return false;
  log.erase(found);
  return true;
}

void Explainer::printRestOfLog() {
  for (const model::LogLine& line : log) {
    const size_t end = line.text.find_last_not_of('\n');
    std::fprintf(out, "  logged: %s: %s\n", line.tag.c_str(), line.text.substr(0, end + 1).c_str());
  }
}

void Explainer::printBlock(const CallOutcome& outcome, const std::string& what) {
  if (begun) std::fputc('\n', out);
  printLine(outcome, what);
}

void Explainer::printLine(const CallOutcome& outcome, const std::string& what) {
  begun = true;
  if (outcome.call.line != 0) std::fprintf(out, "line %zu: ", outcome.call.line);
  std::fprintf(out, "%s on %s %s\n", outcome.session.c_str(), outcome.sensor->name, what.c_str());
}

Account& Explainer::accountOf(const std::string& session, const Sensor* sensor) {
  const auto known = std::find_if(accounts.begin(), accounts.end(), [&](const Account& account) {
    return account.session == session && account.sensor == sensor;
  });
  if (known != accounts.end()) return *known;
  return accounts.emplace_back(Account{.session = session, .sensor = sensor});
}

Explainer::SessionIterator Explainer::find(const std::string& name) {
  return std::find_if(sessions.begin(), sessions.end(),
                      [&name](const Session& session) { return session.name == name; });
}

}  // namespace senseloom::tool
