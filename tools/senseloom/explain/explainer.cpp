#include "explain/explainer.h"

#include <algorithm>
#include <string_view>
#include <utility>

#include "explain/negotiation_output.h"

namespace senseloom::tool {
namespace {

// Lines that tell that a negotiation takes place, which is no news here.
constexpr std::string_view kNegotiationTag = "Libsl";

bool isActivity(const RecordLayout& sensor) {
  return std::string_view(sensor.sensor) == "PHYAC";
}

}  // namespace

void Explainer::onOutcome(const CallOutcome& outcome) {
  log = library.take();
  std::erase_if(log, [](const LogLine& line) { return line.tag == kNegotiationTag; });
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
      for (Session& session : sessions) session.isForeign = true;
      break;
  }
}

void Explainer::onEnd() {
  printAccounts(out, accounts);
}

void Explainer::open(const CallOutcome& outcome) {
  accountOf(outcome);
  if (outcome.failed) {
    printBlock(outcome, "does not open");
    printRestOfLog();
    return;
  }
  sessions.push_back({.name = outcome.session,
                      .sensor = outcome.sensor,
                      .wishes = Wishes(*findOptionDescription(outcome.sensor->sensor)),
                      .model = makeSessionModel(*outcome.sensor, gestures)});
}

void Explainer::setOption(const CallOutcome& outcome) {
  const auto session = find(outcome.session);
  printBlock(outcome, "sets " + outcome.call.option.value_or("a null pointer"));
  if (session == sessions.end()) {
    std::fputs("  refused: the session did not open\n", out);
    return;
  }
  OptionReading reading = readOption(session->wishes.kind(), outcome.call.option, templates);
  printRemarks(reading.remarks);
  if (reading.wishes) session->wishes = *std::move(reading.wishes);
  if (reading.accepted) {
    negotiate(outcome, *session);
  } else {
    checkReturn(outcome, -1);
    if (outcome.failed) std::fputs("  refused: nothing changes\n", out);
  }
  printRestOfLog();
}

void Explainer::dispatch(const CallOutcome& outcome) {
  const auto session = find(outcome.session);
  const Verdict verdict =
      session == sessions.end() ? Verdict{Fate::refused} : session->model->judge(session->wishes, outcome.record, log);
  Account& account = accountOf(outcome);
  if (verdict.returned() != outcome.returned) {
    ++account.unexplained;
    printLine(outcome, "unexplained: the library returned " + std::to_string(outcome.returned) +
                           ", where this was derived: " + verdict.text());
    return;
  }
  ++account.fates[static_cast<size_t>(verdict.fate)];
  if (records) printLine(outcome, verdict.text());
}

void Explainer::close(const CallOutcome& outcome) {
  const auto closing = find(outcome.session);
  // At the end of the trace sessions are closed by the tool, which is no news but for what they made of the records.
  const bool isAtEnd = outcome.call.line == 0;
  const std::string account = closing == sessions.end() ? "" : closing->model->account();
  if (!isAtEnd || !account.empty()) printBlock(outcome, isAtEnd ? "is open at the end" : "leaves");
  if (!account.empty()) std::fprintf(out, "  %s\n", account.c_str());
  if (closing == sessions.end()) return;
  accountOf(outcome).chain = closing->model->chain();
  const Session closed = std::move(*closing);
  sessions.erase(closing);
  const auto first = std::find_if(sessions.begin(), sessions.end(), [&closed](const Session& session) {
    return session.sensor == closed.sensor && !session.isForeign;
  });
  if (first != sessions.end() && !isAtEnd) negotiate(outcome, *first);
  if (!isAtEnd) printRestOfLog();
}

void Explainer::negotiate(const CallOutcome& outcome, const Session& starter) {
  std::vector<Participant> participants;
  size_t starterIndex = 0;
  for (const Session& session : sessions) {
    if (&session != &starter && (session.isForeign || session.sensor != starter.sensor)) continue;
    if (&session == &starter) starterIndex = participants.size();
    participants.push_back({session.name, &session.wishes});
  }
  const MergeDerivation derivation = deriveMerge(participants, starterIndex, starter.isForeign, templates);
  printNegotiation(out, participants, derivation, outcome.properties);
  if (!derivation.logged.empty()) printRemarks({{"no property list: " + derivation.conflict, derivation.logged}});

  const bool isClose = outcome.call.kind == CallKind::close;
  const int success = isClose ? 1 : 0;
  checkReturn(outcome, derivation.properties || isClose ? success : -1);
  if (isActivity(*starter.sensor)) restartSessions(*starter.sensor, *derivation.keys[2].value);
}

void Explainer::restartSessions(const RecordLayout& sensor, int32_t leastLogM) {
  for (Session& session : sessions) {
    if (session.sensor != &sensor || session.isForeign) continue;
    session.model->restart(session.wishes, leastLogM);
    std::fprintf(out, "  chain of %s: %s\n", session.name.c_str(), session.model->chain().c_str());
  }
}

void Explainer::checkReturn(const CallOutcome& outcome, int expected) {
  if (outcome.returned == expected) return;
  std::fprintf(out, "  unexplained: the library returned %d, where %d was derived\n", outcome.returned, expected);
}

void Explainer::printRemarks(const std::vector<Remark>& remarks) {
  for (const Remark& remark : remarks) {
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
  const auto found = std::find_if(log.begin(), log.end(), [&text](const LogLine& line) { return line.text == text; });
  if (found == log.end()) return false;
  log.erase(found);
  return true;
}

void Explainer::printRestOfLog() {
  for (const LogLine& line : log) std::fprintf(out, "  logged: %s: %s\n", line.tag.c_str(), line.text.c_str());
}

void Explainer::printBlock(const CallOutcome& outcome, const std::string& what) {
  if (begun) std::fputc('\n', out);
  printLine(outcome, what);
}

void Explainer::printLine(const CallOutcome& outcome, const std::string& what) {
  begun = true;
  if (outcome.call.line != 0) std::fprintf(out, "line %zu: ", outcome.call.line);
  std::fprintf(out, "%s on %s %s\n", outcome.session.c_str(), outcome.sensor->sensor, what.c_str());
}

Account& Explainer::accountOf(const CallOutcome& outcome) {
  const auto known = std::find_if(accounts.begin(), accounts.end(), [&outcome](const Account& account) {
    return account.session == outcome.session && account.sensor == outcome.sensor;
  });
  if (known != accounts.end()) return *known;
  return accounts.emplace_back(Account{.session = outcome.session, .sensor = outcome.sensor});
}

Explainer::SessionIterator Explainer::find(const std::string& name) {
  return std::find_if(sessions.begin(), sessions.end(),
                      [&name](const Session& session) { return session.name == name; });
}

}  // namespace senseloom::tool
