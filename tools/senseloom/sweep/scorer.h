#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <vector>

#include "kinds/sensor_table.h"
#include "sweep/figures.h"
#include "sweep/sweep_script.h"

namespace senseloom::tool {

// What all combinations of a sweep have in common.
struct SweepTotals {
  bool truthKnown = false;  // and there are classes to compare with it
  int64_t time = 0;         // that the session is open, from the first record to the last, in nanoseconds
  int64_t labelled = 0;     // of that
  size_t changes = 0;

  SweepTotals(const Sensor& sensor, std::span<const SweepScript> scripts);
};

// Computes the figures of one combination from the results of a replay.
class Scorer {
 public:
  Scorer(const Sensor& sensorOfClient, const SweepTotals& sweepTotals) : sensor(sensorOfClient), totals(sweepTotals) {}

  // A replay of a trace begins. What was before has no meaning for it.
  void begin(const SweepScript& trace);
  // The session started over: what was in its batch is dropped.
  void cutBatch() { batchFirst.reset(); }
  // A record was dispatched. `completes`: with it a batch was complete, whether it was delivered or not.
  void take(size_t record, bool completes, const std::optional<std::span<const uint8_t>>& result);
  // The replay of the trace is over.
  void end() { change.reset(); }

  Figures figures();

 private:
  // A change that the client has not heard of yet.
  struct Change {
    int64_t time;
    int32_t label;
    size_t labelEnds;
  };

  void startChange(const SweepRecord& record);
  void takeResult(size_t record, std::span<const uint8_t> result);
  std::optional<int32_t> classOf(std::span<const uint8_t> result) const;
  bool isFalse(int32_t classNumber, size_t lastRecord) const;
  double perHour(size_t count) const;

  const Sensor& sensor;
  const SweepTotals& totals;
  const SweepScript* script = nullptr;

  std::optional<size_t> batchFirst;  // the first record of the batch
  std::optional<int32_t> held;       // the class of the last result
  std::optional<Change> change;

  size_t results = 0;
  size_t reports = 0;
  size_t noMajority = 0;
  size_t falseReports = 0;
  int64_t right = 0;
  std::vector<int64_t> delays;
  std::vector<int64_t> batchTimes;
};

}  // namespace senseloom::tool
