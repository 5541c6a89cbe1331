#include "plot/replay_plot.h"

#include "plot/picture_file.h"
#include "plot/svg_picture.h"

namespace senseloom::tool {
ReplayPlot::ReplayPlot(std::unique_ptr<ReplayObserver> replayOutput, std::string plotTitle, PlotArguments plotArguments)
    : output(std::move(replayOutput)), title(std::move(plotTitle)), arguments(std::move(plotArguments)) {
  requireWritable(arguments.file);
}

void ReplayPlot::onOutcome(const CallOutcome& outcome) {
  plot.onOutcome(outcome);
  output->onOutcome(outcome);
}

void ReplayPlot::onEnd() {
  writePicture(arguments.file, drawSvg(plot, title, arguments.classNames));
  output->onEnd();
}

std::string traceTitle(const std::string& trace) {
  return trace == "-" ? "standard input" : trace.substr(trace.rfind('/') + 1);
}

std::unique_ptr<ReplayObserver> withPlot(std::unique_ptr<ReplayObserver> output, const std::string& trace,
                                         const PlotArguments& arguments) {
  if (arguments.file.empty()) return output;
  return std::make_unique<ReplayPlot>(std::move(output), traceTitle(trace), arguments);
}

}  // namespace senseloom::tool
