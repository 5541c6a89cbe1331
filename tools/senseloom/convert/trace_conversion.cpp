#include "convert/trace_conversion.h"

#include <memory>
#include <utility>

#include "convert/call_table.h"
#include "convert/trace_events.h"
#include "explain/explainer.h"
#include "explain/log_capture.h"
#include "replay/replay_progress.h"
#include "terminal/interrupt.h"
#include "terminal/output_sink.h"
#include "trace/replayer.h"
#include "trace/time_unit.h"
#include "trace/trace_reader.h"

namespace senseloom::tool {
namespace {

// Hands each call of a replay on with its explanation.
class ConvertingOutput final : public ReplayObserver, private ExplanationOutput {
 public:
  ConvertingOutput(TraceConverter& to, const TraceReader& from, LogSource& log)
      : converter(to), trace(from), explainer(*this, log) {}

  void onOutcome(const CallOutcome& outcome) override {
    isTold = false;
    explainer.onOutcome(outcome);
    if (!isTold) converter.add({.outcome = outcome, .timeUnit = timeUnit()});
  }
  void onEnd() override { explainer.onEnd(); }

 private:
  void onCall(const ExplainedCall& call) override {
    isTold = true;
    converter.add({.outcome = call.outcome, .timeUnit = timeUnit(), .call = &call});
  }
  void onRecord(const ExplainedRecord& record) override {
    isTold = true;
    converter.add({.outcome = record.outcome, .timeUnit = timeUnit(), .record = &record});
  }
  void onEnd(const std::vector<Account>& /*accounts*/) override { converter.end(); }
  int64_t timeUnit() const { return trace.timeUnit().value_or(kMillisecond); }

  TraceConverter& converter;
  const TraceReader& trace;
  Explainer explainer;
  bool isTold = false;  // the explainer has spoken of the call
};

std::unique_ptr<TraceConverter> converterTo(const std::string& form, OutputSink& sink) {
  if (form == "perfetto") return std::make_unique<TraceEvents>(sink);
  return std::make_unique<CallTable>(sink);
}

}  // namespace

void convertTrace(std::FILE* out, const TraceConversion& conversion) {
  const InterruptMark mark;
  TraceReader trace(conversion.trace);
  OutputSink sink(out, conversion.file, conversion.trace);
  const auto converter = converterTo(conversion.to, sink);
  LogCapture log;
  const auto output =
      withProgress(std::make_unique<ConvertingOutput>(*converter, trace, log), trace, out, conversion.file.empty());
  Replayer(*output).replay(trace);
  sink.commit();
}

}  // namespace senseloom::tool
