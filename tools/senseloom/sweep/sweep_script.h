#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "kinds/sensor_table.h"
#include "trace/engine_answer.h"
#include "trace/trace_form.h"

namespace senseloom::tool {

// A place among the bytes of a script.
struct StoredBytes {
  size_t offset;
  size_t length;
};

// A record that the swept client gets. Times are in nanoseconds.
struct SweepRecord {
  StoredBytes bytes;
  int64_t time;
  int64_t lasts = 0;       // until the next record, if the session is still open by then
  int32_t label = 0;       // the class that was true; 0: not known
  bool holdsItems = true;  // it adds to a batch
  bool isChange = false;   // its label differs from the last one other than 0
  size_t labelEnds = 0;    // of a change: the last record with its label before one with another, 0 left out
};

// A call that takes part in a replay, by the swept client or by another client of its sensor.
struct SweepStep {
  CallKind kind;
  size_t client = 0;                     // 0: the swept one
  size_t record = 0;                     // of a dispatch: its place in `records`, or in `foreign` for other clients
  std::optional<std::string> text = {};  // of a set_option by another client; nothing: a null pointer
  std::string head = {};                 // of a set_option by the swept client: its option before the swept members
  bool rebuilds = false;                 // if it negotiates, the swept session starts over
  std::optional<std::vector<EngineAnswer>> engine = {};  // of a dispatch: what the gesture engine is to answer
};

// A trace, reduced to what a replay to one client takes.
struct SweepScript {
  std::vector<SweepStep> steps;
  std::vector<SweepRecord> records;
  std::vector<StoredBytes> foreign;  // records of other clients, where these matter
  std::vector<uint8_t> bytes;
  size_t clients = 1;

  std::span<const uint8_t> bytesAt(const StoredBytes& place) const {
    return std::span(bytes).subspan(place.offset, place.length);
  }
};

// The client whose options are swept: one that the traces have, or one more.
struct SweptClient {
  std::string session = {};            // empty: one more client, on the sensor from the start of each trace on
  const Sensor* sensor = nullptr;      // null until known from the traces
  std::string option = "{}";           // of one more client: what is not swept of it
  std::vector<std::string> keys = {};  // that are swept
};

}  // namespace senseloom::tool
