#pragma once

#include <cstdio>
#include <list>
#include <string>
#include <vector>

#include "explain/account_output.h"
#include "explain/log_capture.h"
#include "model/model.h"
#include "trace/replayer.h"

namespace senseloom::tool {

// Prints why: for each negotiation what every session asked for, what was rejected, and who decided; for each session
// what became of its records. The reasons are those of the model, which is given the same calls. Where the library did
// something else, it says so: "unexplained".
class Explainer final : public ReplayObserver {
 public:
  // Prints what became of each record, too, if `withRecords` is set. `source` is where the library's log goes.
  Explainer(std::FILE* stream, LogSource& source, bool withRecords)
      : out(stream), library(source), records(withRecords) {
    model.explains = true;
  }
  void onOutcome(const CallOutcome& outcome) override;
  void onEnd() override;

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

  void printNegotiation(const CallOutcome& outcome, const model::Outcome& expected);
  // Notes what a negotiation makes of the sessions that start over. What they go on with at the end of the trace, while
  // it is the tool that closes one after the other, is no news.
  void noteRestarts(const model::Negotiation& negotiation, bool isAtEnd);
  void checkReturn(const CallOutcome& outcome, const model::Outcome& expected);
  // Prints what is told of an option, each with what the library logged about it.
  void printRemarks(const std::vector<model::Remark>& remarks);
  // The log line of that text, for which it is taken as explained; false when there is none.
  bool takeLogged(const std::string& text);
  void printRestOfLog();
  // A block of several lines, apart from what is before it.
  void printBlock(const CallOutcome& outcome, const std::string& what);
  void printLine(const CallOutcome& outcome, const std::string& what);
  Account& accountOf(const std::string& session, const Sensor* sensor);
  SessionIterator find(const std::string& name);

  std::FILE* out;
  LogSource& library;
  bool records;
  bool begun = false;           // something was printed
  model::Log log;               // of the call, but for what was explained
  model::Model model;           // what the library should do
  std::list<Session> sessions;  // those that are open, in opening order
  std::vector<Account> accounts;
};

}  // namespace senseloom::tool
