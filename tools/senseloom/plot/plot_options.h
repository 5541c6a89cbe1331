#pragma once

#include "plot/replay_plot.h"

namespace CLI {
class App;
class Option;
}  // namespace CLI

namespace senseloom::tool {

// Adds the options about a picture to a command that replays a trace. Returns the one that asks for a picture.
CLI::Option* addPlotOptions(CLI::App& command, PlotArguments& plot);

}  // namespace senseloom::tool
