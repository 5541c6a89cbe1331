#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <map>
#include <string>
#include <utility>
#include <vector>

#include "explain/account.h"
#include "explain/explanation.h"
#include "trace/replayer.h"

namespace senseloom::tool {

// What is shown of a client: of the sessions that one name had on one sensor, one after the other.
struct BoardRow {
  std::string session;
  std::string sensor;
  std::string request;  // in effect; "closed" if it is not open
  size_t records = 0;
  size_t results = 0;
  double rate = 0;         // records a second, of late
  std::string lastResult;  // its fields; empty: there was none
  std::string reason;      // that most of its records did not arrive for, and how many they were
};

// Gathers what a screen shows of a replay: a row a client, in opening order. It is told of every call twice: of its
// outcome, and of its explanation.
class Board final : public ReplayObserver, public ExplanationOutput {
 public:
  using Clock = std::chrono::steady_clock;

  // Whether the call that it is told of next is to be shown: counted, and its client given a row.
  void choose(bool isNextWanted) { isWanted = isNextWanted; }

  void onOutcome(const CallOutcome& outcome) override;
  void onEnd() override {}
  void onCall(const ExplainedCall& call) override;
  void onRecord(const ExplainedRecord& record) override;
  void onEnd(const std::vector<Account>& accounts) override;

  // Counts for the rates, which are those of the time between two calls that are a second or more apart.
  void measure(Clock::time_point now);

  std::vector<BoardRow> rows() const;
  // What became of the records that were counted, once the trace is at its end.
  const std::vector<Account>& accounts() const { return summary; }

 private:
  struct Client {
    Account account;  // its fates
    bool isShown = false;
    bool isOpen = false;
    std::string request = {};
    size_t records = 0;
    size_t results = 0;
    size_t measured = 0;  // records until the last measurement
    double rate = 0;
    std::vector<uint8_t> lastResult = {};
  };

  Client& clientOf(const std::string& session, const Sensor* sensor);

  bool isWanted = true;
  std::vector<Client> clients;
  std::map<std::pair<const Sensor*, std::string>, size_t> places;  // in `clients`
  Clock::time_point lastMeasurement = Clock::time_point::min();
  std::vector<Account> summary;
};

}  // namespace senseloom::tool
