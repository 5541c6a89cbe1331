#pragma once

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "plot/plot.h"
#include "trace/replayer.h"

namespace senseloom::tool {

// What the user says about a picture.
struct PlotArguments {
  std::string file = {};                     // empty: no picture is wanted
  std::vector<std::string> classNames = {};  // from class 0 on
};

// Passes everything on to an output, and at the end writes a picture of the replay. Throws std::runtime_error if the
// file cannot be written, and does so at once if it cannot be opened.
class ReplayPlot final : public ReplayObserver {
 public:
  ReplayPlot(std::unique_ptr<ReplayObserver> replayOutput, std::string plotTitle, PlotArguments plotArguments);
  void onOutcome(const CallOutcome& outcome) override;
  void onEnd() override;

 private:
  std::unique_ptr<ReplayObserver> output;
  const std::string title;
  const PlotArguments arguments;
  Plot plot;
};

// What a trace is called where it is shown: the name of its file.
std::string traceTitle(const std::string& trace);

// Adds a picture of a trace to an output, if one is wanted.
std::unique_ptr<ReplayObserver> withPlot(std::unique_ptr<ReplayObserver> output, const std::string& trace,
                                         const PlotArguments& arguments);

}  // namespace senseloom::tool
