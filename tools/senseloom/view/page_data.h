#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "explain/explainer.h"
#include "explain/filtered_explanation.h"
#include "explain/log_capture.h"
#include "trace/json.h"
#include "trace/record_joiner.h"
#include "trace/replayer.h"
#include "view/page_records.h"

namespace senseloom::tool {

// Gathers what a page shows of a replay: each record with what became of it for each session, and every other call with
// what it negotiated, of the calls that a filter takes. What goes to several sessions one after the other, byte for
// byte, is one record.
class PageData final : public ReplayObserver, private ExplanationOutput {
 public:
  // `source` is where the library's log goes.
  PageData(LogSource& source, CallFilter& callFilter)
      : filter(callFilter), filtered(*this, filter), explainer(filtered, source) {}
  void onOutcome(const CallOutcome& outcome) override;
  void onEnd() override;

  // All but the records. `classNames` are those of the classes from 0 on.
  Json summary(const std::vector<std::string>& classNames) const;
  const PageRecords& pageRecords() const { return records; }

 private:
  // The sessions that one name had on one sensor, one after the other.
  struct Client {
    std::string name;
    uint32_t sensor;
    uint32_t lane;
    std::array<size_t, kUnexplainedFate + 1> fates{};
    size_t results = 0;
  };
  struct ShownSensor {
    const Sensor* sensor;
    uint32_t lane;
    RecordHues shown = {};  // of all records and results
  };

  void onCall(const ExplainedCall& call) override;
  void onRecord(const ExplainedRecord& explained) override;
  void onEnd(const std::vector<Account>& accounts) override;

  void beginRecord(const CallOutcome& outcome);
  void endRecord();
  // Adds what is told of a call that is no dispatch.
  void addEvent(const CallOutcome& outcome, Json event);
  uint32_t sensorOf(const Sensor* sensor);
  uint32_t clientOf(const CallOutcome& outcome);

  CallFilter& filter;
  FilteredExplanation filtered;
  Explainer explainer;
  std::vector<ShownSensor> sensors;
  std::vector<Client> clients;
  uint32_t lanes = 0;
  size_t calls = 0;
  size_t lastLine = 0;
  uint64_t timestamp = 0;            // of the last record that has one
  std::optional<PageRecord> record;  // the one under way
  RecordJoiner joiner;
  PageRecords records;
  Json events{json_array()};
  size_t timedEvents = 0;  // the first ones of them, for which the next record has come
};

}  // namespace senseloom::tool
