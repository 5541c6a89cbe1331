#pragma once

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "plot/plot.h"
#include "trace/call_filter.h"
#include "trace/class_names.h"
#include "trace/replayer.h"
#include "trace/trace_reader.h"

namespace senseloom::tool {

// What the user says about a picture.
struct PlotArguments {
  std::string file = {};        // empty: no picture is wanted
  std::string classNames = {};  // for readClassNames(); empty: those of the trace
};

// Passes everything on to an output, and at the end writes a picture of those calls that a filter takes. Throws as
// requireWritable() and CallFilter do, at once.
class ReplayPlot final : public ReplayObserver {
 public:
  ReplayPlot(std::unique_ptr<ReplayObserver> replayOutput, const TraceReader& reader, PlotArguments plotArguments,
             const FilterArguments& filterArguments);
  void onOutcome(const CallOutcome& outcome) override;
  void onNote(size_t line, const std::string& text) override { output->onNote(line, text); }
  void onEnd() override;

 private:
  std::unique_ptr<ReplayObserver> output;
  const TraceReader& trace;
  const PlotArguments arguments;
  CallFilter filter;
  Plot plot;
};

// What a trace is called where it is shown: the name of its file.
std::string traceTitle(const std::string& trace);
// The names of classes that the user gives, as readClassNames() takes them, or else those of the trace so far.
ClassNames classNamesOf(const std::string& given, const TraceReader& trace);

// Adds a picture of a trace to an output, if one is wanted.
std::unique_ptr<ReplayObserver> withPlot(std::unique_ptr<ReplayObserver> output, const TraceReader& trace,
                                         const PlotArguments& arguments, const FilterArguments& filter);

}  // namespace senseloom::tool
