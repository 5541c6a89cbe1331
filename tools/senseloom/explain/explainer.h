#pragma once

#include <list>
#include <map>
#include <string>
#include <vector>

#include "explain/explanation.h"
#include "explain/log_capture.h"
#include "model/model.h"
#include "trace/replayer.h"

namespace senseloom::tool {

// Finds out why: for each negotiation what every session asked for, what was rejected, and who decided; for each
// session what became of its records. The reasons are those of the model, which is given the same calls. Where the
// library did something else, it says so: "unexplained".
class Explainer final : public ReplayObserver {
 public:
  // `source` is where the library's log goes.
  Explainer(ExplanationOutput& explanations, LogSource& source) : output(explanations), library(source) {
    model.explains = true;
  }
  void onOutcome(const CallOutcome& outcome) override;
  void onEnd() override { output.onEnd(accounts); }

 private:
  // Its address is its handle in the model.
  struct Session {
    std::string name;
    const Sensor* sensor;
    model::ItemCounts items = {};
  };
  using SessionIterator = std::list<Session>::iterator;

  void open(const CallOutcome& outcome);
  void setOption(const CallOutcome& outcome);
  void dispatch(const CallOutcome& outcome);
  void close(const CallOutcome& outcome);

  // What is to be told of a negotiation, but for what it does to the sessions.
  ExplainedNegotiation explained(const CallOutcome& outcome, const model::Negotiation& negotiation, const void* caller);
  // Notes what a negotiation makes of the sessions that start over. What they go on with at the end of the trace, while
  // it is the tool that closes one after the other, is no news.
  void noteRestarts(const model::Negotiation& negotiation, bool isAtEnd, std::vector<size_t>& restarted);
  void tellResult(const model::Outcome& expected, ExplainedCall& call);
  // What the model says, each with what the library logged about it.
  void tell(const std::vector<model::Remark>& remarks, Told::About about, std::vector<Told>& told);
  void tellRestOfLog(std::vector<Told>& told);
  // The log line of that text, for which it is taken as explained; false when there is none.
  bool takeLogged(const std::string& text);
  Account& accountOf(const std::string& session, const Sensor* sensor);
  SessionIterator find(const std::string& name);

  ExplanationOutput& output;
  LogSource& library;
  model::Log log;               // of the call, but for what was explained
  model::Model model;           // what the library should do
  std::list<Session> sessions;  // those that are open, in opening order
  std::vector<Account> accounts;
  std::map<const Sensor*, std::vector<model::MergedKey>> merged;  // as each sensor negotiated last
};

}  // namespace senseloom::tool
