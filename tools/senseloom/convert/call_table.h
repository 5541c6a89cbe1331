#pragma once

#include <string>
#include <vector>

#include "convert/trace_converter.h"
#include "terminal/output_sink.h"

namespace senseloom::tool {

// Writes a table with a row per call and session, in cells between commas as RFC 4180 has them. docs/traces.md explains
// the columns.
class CallTable final : public TraceConverter {
 public:
  explicit CallTable(OutputSink& output);
  void add(const ConvertedCall& converted) override;
  void end() override {}

 private:
  void writeRow(const std::vector<std::string>& cells);

  OutputSink& sink;
};

}  // namespace senseloom::tool
