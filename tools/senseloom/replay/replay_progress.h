#pragma once

#include <cstdio>
#include <memory>
#include <optional>
#include <utility>

#include "terminal/progress_bar.h"
#include "trace/replayer.h"
#include "trace/trace_reader.h"

namespace senseloom::tool {

// Passes everything on to an output, and shows how much of the trace was read in the meantime. The bar is gone before
// the output says what it has to say at the end.
class ReplayProgress final : public ReplayObserver {
 public:
  ReplayProgress(std::unique_ptr<ReplayObserver> replayOutput, const TraceReader& reader, std::FILE* terminal)
      : output(std::move(replayOutput)), trace(reader), bar(std::in_place, terminal, reader.size()) {}
  void onOutcome(const CallOutcome& outcome) override;
  void onEnd() override;

 private:
  std::unique_ptr<ReplayObserver> output;
  const TraceReader& trace;
  std::optional<ProgressBar> bar;
};

// Adds a bar on standard error to an output for a trace of 1 MiB or more, when standard error is a terminal.
// `isFilling`: the output prints as the trace goes, so on a terminal of its own the output is all that is to be seen.
std::unique_ptr<ReplayObserver> withProgress(std::unique_ptr<ReplayObserver> output, const TraceReader& trace,
                                             std::FILE* out, bool isFilling);

}  // namespace senseloom::tool
