#pragma once

#include <cstdio>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "explain/account_output.h"
#include "explain/gesture_model.h"
#include "explain/log_capture.h"
#include "explain/merge_derivation.h"
#include "explain/option_reading.h"
#include "explain/session_model.h"
#include "replay/replayer.h"

namespace senseloom::tool {

// Prints why: for each negotiation what every session asked for, what was rejected, and who decided; for each session
// what became of its records. The reasons are derived beside the library, from the options and the records. Where the
// library did otherwise it says so: "unexplained".
class Explainer final : public ReplayObserver {
 public:
  // Prints what became of each record, too, if `withRecords` is set. `capture` is where the library's log goes.
  Explainer(std::FILE* stream, LogCapture& capture, bool withRecords)
      : out(stream), library(capture), records(withRecords) {}
  void onOutcome(const CallOutcome& outcome) override;
  void onEnd() override;

 private:
  struct Session {
    std::string name;
    const RecordLayout* sensor;
    Wishes wishes;
    std::unique_ptr<SessionModel> model;
    bool isForeign = false;  // its sensor went with an uninit: it negotiates with nobody
  };
  using SessionIterator = std::vector<Session>::iterator;

  void open(const CallOutcome& outcome);
  void setOption(const CallOutcome& outcome);
  void dispatch(const CallOutcome& outcome);
  void close(const CallOutcome& outcome);

  // Explains the negotiation that begins with the wishes of `starter`.
  void negotiate(const CallOutcome& outcome, const Session& starter);
  void restartSessions(const RecordLayout& sensor, int32_t leastLogM);
  void checkReturn(const CallOutcome& outcome, int expected);
  // Prints what is told of an option, each with what the library logged about it.
  void printRemarks(const std::vector<Remark>& remarks);
  // The log line of that text, for which it is taken as explained; false when there is none.
  bool takeLogged(const std::string& text);
  void printRestOfLog();
  // A block of several lines, apart from what is before it.
  void printBlock(const CallOutcome& outcome, const std::string& what);
  void printLine(const CallOutcome& outcome, const std::string& what);
  Account& accountOf(const CallOutcome& outcome);
  SessionIterator find(const std::string& name);

  std::FILE* out;
  LogCapture& library;
  bool records;
  bool begun = false;             // something was printed
  std::vector<LogLine> log;       // of the call, but for what was explained
  std::vector<Session> sessions;  // in opening order
  std::vector<Account> accounts;
  TemplateLengths templates{};
  GestureState gestures;
};

}  // namespace senseloom::tool
