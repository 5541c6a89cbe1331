#pragma once

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <optional>
#include <span>
#include <string>
#include <string_view>

#include "trace/class_names.h"
#include "trace/json.h"
#include "trace/replayer.h"
#include "trace/trace_reader.h"
#include "trace/trace_time.h"

namespace senseloom::tool {

// When a call was made, as a table tells it.
enum class Times { none, elapsed, clock };

// What a table shows.
struct TableForm {
  bool all = false;  // also records that delivered nothing
  bool hex = false;  // records as bytes
  Times times = Times::none;
  std::optional<int64_t> timeUnit = {};  // of timestamps, in nanoseconds; nothing: that of the trace
  ClassNames classNames = {};            // empty: those of the trace
};

// Prints a table for people, as the replay goes on: one row per call and session, with what went in and what came out.
// Long lists are cut short.
class TableOutput final : public ReplayObserver {
 public:
  TableOutput(std::FILE* stream, const TableForm& tableForm, const TraceReader& reader)
      : out(stream), form(tableForm), trace(reader), time(reader, tableForm.timeUnit) {}
  void onOutcome(const CallOutcome& outcome) override;
  void onNote(size_t line, const std::string& text) override;

 private:
  using Decode = Json(const Sensor& sensor, std::span<const uint8_t> bytes);
  struct Cells {
    std::string_view line;
    std::string time;
    std::string_view call;
    std::string_view session;
    std::string_view sensor;
    std::string_view returned;
    std::string_view text;
  };

  std::string outcomeText(const CallOutcome& outcome) const;
  std::string givenText(const CallOutcome& outcome) const;
  std::string resultText(const CallOutcome& outcome) const;
  std::string recordText(const Sensor& sensor, std::span<const uint8_t> bytes, Decode* decode) const;
  std::string fieldsText(json_t* value, const Sensor& sensor) const;
  std::string nameText(const Sensor& sensor, int64_t classNumber) const;
  std::string timeText() const;
  void printHeading();
  void printRow(std::string_view line, std::string_view call, std::string_view session, std::string_view sensor,
                std::string_view returned, std::string_view text);
  void printCells(const Cells& cells);

  std::FILE* out;
  const TableForm form;
  const TraceReader& trace;
  TraceTime time;
  bool headed = false;
  size_t sessionWidth = 8;  // grows with the longest name so far
};

}  // namespace senseloom::tool
