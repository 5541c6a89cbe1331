#pragma once

#include <cstdio>
#include <memory>
#include <optional>
#include <utility>

#include "terminal/progress_bar.h"
#include "trace/replayer.h"
#include "trace/trace_reader.h"

namespace senseloom::tool {

// Passes everything on to an output, and shows meanwhile how much of the trace was read. The bar disappears before the
// output prints its end.
class ReplayProgress final : public ReplayObserver {
 public:
  ReplayProgress(std::unique_ptr<ReplayObserver> replayOutput, const TraceReader& reader, std::FILE* terminal)
      : output(std::move(replayOutput)), trace(reader), bar(std::in_place, terminal, reader.size()) {}
  void onOutcome(const CallOutcome& outcome) override;
  void onNote(size_t line, const std::string& text) override { output->onNote(line, text); }
  void onEnd() override;

 private:
  std::unique_ptr<ReplayObserver> output;
  const TraceReader& trace;
  std::optional<ProgressBar> bar;
};

// Adds a bar on standard error to an output for a trace of 1 MiB or more, when standard error is a terminal.
// `isFilling`: the output prints as the replay goes on, so where it goes to a terminal it leaves no room for a bar.
std::unique_ptr<ReplayObserver> withProgress(std::unique_ptr<ReplayObserver> output, const TraceReader& trace,
                                             std::FILE* out, bool isFilling);

}  // namespace senseloom::tool
