#include "plot/replay_plot.h"

#include <span>

#include "plot/picture_file.h"
#include "plot/svg_picture.h"
#include "trace/time_unit.h"

namespace senseloom::tool {

ReplayPlot::ReplayPlot(std::unique_ptr<ReplayObserver> replayOutput, const TraceReader& reader,
                       PlotArguments plotArguments, const FilterArguments& filterArguments)
    : output(std::move(replayOutput)),
      trace(reader),
      arguments(std::move(plotArguments)),
      filter(filterArguments, reader) {
  requireWritable(arguments.file, std::span(&trace.fileName(), 1));
}

void ReplayPlot::onOutcome(const CallOutcome& outcome) {
  if (filter.takes(outcome)) plot.onOutcome(outcome);
  output->onOutcome(outcome);
}

void ReplayPlot::onEnd() {
  writePicture(arguments.file, drawSvg(plot, {.title = traceTitle(trace.fileName()),
                                              .classNames = classNamesOf(arguments.classNames, trace),
                                              .timeUnit = trace.timeUnit().value_or(kMillisecond)}));
  output->onEnd();
}

std::string traceTitle(const std::string& trace) {
  return trace == "-" ? "standard input" : trace.substr(trace.rfind('/') + 1);
}

ClassNames classNamesOf(const std::string& given, const TraceReader& trace) {
  return given.empty() ? trace.classNames() : readClassNames(given);
}

std::unique_ptr<ReplayObserver> withPlot(std::unique_ptr<ReplayObserver> output, const TraceReader& trace,
                                         const PlotArguments& arguments, const FilterArguments& filter) {
  if (arguments.file.empty()) return output;
  return std::make_unique<ReplayPlot>(std::move(output), trace, arguments, filter);
}

}  // namespace senseloom::tool
