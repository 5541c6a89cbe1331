#include "explain/explainer.h"

#include <algorithm>
#include <string_view>
#include <utility>

#include "explain/platform_answers.h"
#include "trace/property_text.h"

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

std::string withoutLineFeed(const std::string& line) {
  return line.substr(0, line.find_last_not_of('\n') + 1);
}

// Compares the two lists entry by entry.
void tellDifferences(const std::optional<model::PropertyList>& expected, const std::optional<PropertyList>& returned,
                     std::vector<Told>& told) {
  if (expected.has_value() != returned.has_value()) {
    told.push_back(
        {Told::unexplained, std::string("the library returned ") + (returned ? "a" : "no") + " property list"});
  }
  if (!expected || !returned) return;
  PropertyList derived;
  for (const model::Property& entry : *expected)
    derived.push_back({entry.id, {entry.value.begin(), entry.value.end()}});
  for (size_t i = 0; i < std::max(derived.size(), returned->size()); ++i) {
    const auto text = [i](const PropertyList& list) {
      return i < list.size() ? std::to_string(list[i].id) + " = " + valueText(list[i]) : std::string("nothing");
    };
    const bool hasBoth = i < derived.size() && i < returned->size();
    if (hasBoth && derived[i].id == (*returned)[i].id && derived[i].value == (*returned)[i].value) continue;
    told.push_back({Told::unexplained, "property " + text(*returned) + ", where " + text(derived) + " was derived"});
  }
}

void tellCounts(const model::ItemCounts& counts, std::vector<Told>& told) {
  for (const model::ItemCount& count : counts.told()) {
    told.push_back({count.isLoss ? Told::loss : Told::note, count.text});
  }
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
      merged.clear();
      break;
  }
}

void Explainer::open(const CallOutcome& outcome) {
  Account& account = accountOf(outcome.session, outcome.sensor);
  const Session& session = sessions.emplace_back(Session{outcome.session, outcome.sensor});
  const model::Outcome expected = model.open(outcome.sensor->name, &session);
  const bool isExpected = expected.returned == 1;
  ExplainedCall call{.outcome = outcome, .what = outcome.failed ? "does not open" : "opens", .told = {}};
  tell(expected.why.remarks, outcome.failed ? Told::refusal : Told::remark, call.told);
  if (isExpected == outcome.failed) {
    call.told.push_back({Told::unexplained, outcome.failed ? "the library opened no session, where one was derived"
                                                           : "no session was derived"});
  }
  if (outcome.failed) {
    if (isExpected) model.close(&session, true);
    sessions.pop_back();
    tellRestOfLog(call.told);
  } else {
    account.chain = model.chain(&session);
  }
  if (!call.told.empty()) output.onCall(call);
}

void Explainer::setOption(const CallOutcome& outcome) {
  const auto session = find(outcome.session);
  const auto& text = outcome.call.option;
  ExplainedCall call{.outcome = outcome, .what = "sets " + text.value_or("a null pointer"), .told = {}};
  if (session == sessions.end()) {
    call.told.push_back({Told::refusal, "refused: the session did not open"});
    output.onCall(call);
    return;
  }
  const model::Outcome expected = model.setOption(&*session, text ? text->c_str() : nullptr, true);
  tell(expected.why.remarks, Told::remark, call.told);
  if (expected.why.negotiation) {
    call.negotiation = explained(outcome, *expected.why.negotiation, &*session);
    noteRestarts(*expected.why.negotiation, false, call.negotiation->restarted);
  } else if (outcome.failed) {
    call.toldAfter.push_back({Told::refusal, "refused: nothing changes"});
  }
  tellResult(expected, call);
  tellRestOfLog(call.toldAfter);
  output.onCall(call);
  if (expected.why.negotiation) merged[outcome.sensor] = expected.why.negotiation->keys;
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
  ExplainedRecord record{.outcome = outcome, .verdict = expected.why.verdict};
  if (record.verdict.returned() != outcome.returned) {
    record.unexplained = "the library returned " + std::to_string(outcome.returned) +
                         ", where this was derived: " + record.verdict.text();
  } else if (!isDelivered(outcome, expected)) {
    record.unexplained = "the library delivered other bytes than were derived";
  }
  Account& account = accountOf(outcome.session, outcome.sensor);
  ++(record.unexplained.empty() ? account.fates[static_cast<size_t>(record.verdict.fate)] : account.unexplained);
  output.onRecord(record);
}

void Explainer::close(const CallOutcome& outcome) {
  const auto closing = find(outcome.session);
  // At the end of the trace sessions are closed by the tool, which is no news but for what they made of the records.
  const bool isAtEnd = outcome.call.line == 0;
  ExplainedCall call{.outcome = outcome, .what = isAtEnd ? "is open at the end" : "leaves", .told = {}};
  if (closing == sessions.end()) {
    if (!isAtEnd) output.onCall(call);
    return;
  }
  const model::Outcome expected = model.close(&*closing, true);
  closing->items += expected.why.items;
  tellCounts(closing->items, call.told);
  tell(expected.why.remarks, Told::refusal, call.told);
  sessions.erase(closing);
  const auto& negotiation = expected.why.negotiation;
  std::vector<size_t> restarted;
  if (negotiation) noteRestarts(*negotiation, isAtEnd, restarted);
  if (negotiation && !isAtEnd) {
    call.negotiation = explained(outcome, *negotiation, nullptr);
    call.negotiation->restarted = std::move(restarted);
  }
  tellResult(expected, call);
  if (!isAtEnd) tellRestOfLog(call.toldAfter);
  if (!isAtEnd || !call.told.empty() || !call.toldAfter.empty()) output.onCall(call);
  if (negotiation) merged[outcome.sensor] = negotiation->keys;
}

ExplainedNegotiation Explainer::explained(const CallOutcome& outcome, const model::Negotiation& negotiation,
                                          const void* caller) {
  ExplainedNegotiation told{.derived = &negotiation,
                            .names = {},
                            .caller = 0,
                            .before = nullptr,
                            .properties = &outcome.properties,
                            .restarted = {}};
  for (const auto& participant : negotiation.participants) {
    if (participant.handle == caller) told.caller = told.names.size();
    told.names.push_back(static_cast<const Session*>(participant.handle)->name);
  }
  if (caller == nullptr) told.caller = told.names.size();
  const auto before = merged.find(outcome.sensor);
  if (before != merged.end()) told.before = &before->second;
  return told;
}

void Explainer::noteRestarts(const model::Negotiation& negotiation, bool isAtEnd, std::vector<size_t>& restarted) {
  for (size_t i = 0; i < negotiation.participants.size(); ++i) {
    const model::Participant& participant = negotiation.participants[i];
    if (participant.chain.empty()) continue;
    const auto session =
        std::find_if(sessions.begin(), sessions.end(), [&](const Session& one) { return &one == participant.handle; });
    session->items.cutOff += participant.cutOff;
    if (isAtEnd) continue;
    std::string& chain = accountOf(session->name, session->sensor).chain;
    if (chain != participant.chain) restarted.push_back(i);
    chain = participant.chain;
  }
}

void Explainer::tellResult(const model::Outcome& expected, ExplainedCall& call) {
  if (call.negotiation) {
    tellDifferences(expected.list, call.outcome.properties, call.toldAfter);
    const auto& conflict = expected.why.negotiation->conflict;
    if (conflict) tell({*conflict}, Told::refusal, call.toldAfter);
  }
  const int returned = call.outcome.returned;
  if (returned == expected.returned) return;
  call.toldAfter.push_back({Told::unexplained, "the library returned " + std::to_string(returned) + ", where " +
                                                   std::to_string(expected.returned) + " was derived"});
}

void Explainer::tell(const std::vector<model::Remark>& remarks, Told::About about, std::vector<Told>& told) {
  for (const model::Remark& remark : remarks) {
    const bool isLogged = !remark.logged.empty() && takeLogged(remark.logged);
    told.push_back({about, remark.text, isLogged ? withoutLineFeed(remark.logged) : ""});
    if (isLogged || remark.logged.empty()) continue;
    told.push_back({Told::unexplained, "the library did not log: " + withoutLineFeed(remark.logged)});
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

void Explainer::tellRestOfLog(std::vector<Told>& told) {
  for (const model::LogLine& line : log) told.push_back({Told::logged, line.tag + ": " + withoutLineFeed(line.text)});
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
