#include "explain/explanation_text.h"

#include "explain/account_table.h"
#include "explain/negotiation_table.h"

namespace senseloom::tool {
namespace {

// After so many negotiations only what changes is printed.
constexpr size_t kFewNegotiations = 40;

// What a recording says of the gesture engine's part in what became of a record.
std::string engineText(const TraceCall& call) {
  const bool hasAnswered = call.engine && !call.engine->empty();
  return hasAnswered ? ", where the gesture engine answered " + answersText(*call.engine) : "";
}

}  // namespace

void ExplanationText::onCall(const ExplainedCall& call) {
  if (call.negotiation) ++negotiations;
  if (extent.problems && !call.isProblem()) return;
  if (isQuiet(call)) {
    lastQuietLine = call.outcome.call.line;
    if (quietCalls++ == 0) firstQuietLine = lastQuietLine;
    return;
  }
  printQuietCalls();
  beginBlock();
  printLine(call.outcome, call.what);
  printTold(call.told);
  if (call.negotiation && !extent.problems) printNegotiation(call);
  printTold(call.toldAfter);
}

void ExplanationText::onRecord(const ExplainedRecord& record) {
  const bool isWanted = extent.problems ? record.isProblem() : extent.records || !record.unexplained.empty();
  if (!isWanted) return;
  printQuietCalls();
  const std::string what = record.unexplained.empty() ? record.verdict.text() : "unexplained: " + record.unexplained;
  printLine(record.outcome, what + engineText(record.outcome.call));
}

void ExplanationText::onEnd(const std::vector<Account>& accounts) {
  printQuietCalls();
  if (!extent.problems) printAccounts(out, accounts, extent.all);
}

bool ExplanationText::isQuiet(const ExplainedCall& call) const {
  if (extent.all || call.isProblem() || !call.negotiation) return false;
  const bool isOneOfMany = negotiations > kFewNegotiations || call.negotiation->hasManySessions();
  return isOneOfMany && !call.negotiation->isChange();
}

void ExplanationText::printNegotiation(const ExplainedCall& call) {
  const ExplainedNegotiation& negotiation = *call.negotiation;
  const Sensor& sensor = *call.outcome.sensor;
  if (negotiation.hasManySessions()) {
    printManySessions(out, sensor, negotiation, extent.all);
  } else {
    printFewSessions(out, sensor, negotiation, extent.all || negotiations <= kFewNegotiations);
  }
  printChains(out, negotiation, extent.all || !negotiation.hasManySessions());
}

void ExplanationText::beginBlock() {
  if (begun) std::fputc('\n', out);
}

void ExplanationText::printLine(const CallOutcome& outcome, const std::string& what) {
  begun = true;
  if (outcome.call.line != 0) std::fprintf(out, "line %zu: ", outcome.call.line);
  std::fprintf(out, "%s on %s %s\n", outcome.session.c_str(), outcome.sensor->name, what.c_str());
}

void ExplanationText::printTold(const std::vector<Told>& told) {
  for (const Told& one : told) {
    const char* mark = one.about == Told::unexplained ? "unexplained: " : one.about == Told::logged ? "logged: " : "";
    std::fprintf(out, "  %s%s\n", mark, one.text.c_str());
    if (!one.logLine.empty()) std::fprintf(out, "    logged: %s\n", one.logLine.c_str());
  }
}

void ExplanationText::printQuietCalls() {
  if (quietCalls == 0) return;
  beginBlock();
  begun = true;
  std::fprintf(out,
               "lines %zu to %zu: %zu more calls, after which everything is merged to what it was (--all shows them)\n",
               firstQuietLine, lastQuietLine, quietCalls);
  quietCalls = 0;
}

}  // namespace senseloom::tool
