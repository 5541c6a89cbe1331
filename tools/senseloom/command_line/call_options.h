#pragma once

#include <CLI/CLI.hpp>

#include "plot/replay_plot.h"
#include "trace/call_filter.h"

// Options that several commands have.
namespace senseloom::tool {

// Which calls of a trace are meant: by session, sensor, lines, times and failure. All commands have them that read a
// trace, but for those that it has other words for: of "sweep" and "convert" some have another meaning.
void addFilterOptions(CLI::App& command, FilterArguments& filter);

// How many differences are printed.
void addLimitOption(CLI::App& command, size_t& most);

void addClassNamesOption(CLI::App& command, std::string& names);

// A picture, and the names of classes. Returns the option that asks for a picture.
CLI::Option* addPlotOptions(CLI::App& command, PlotArguments& plot);

}  // namespace senseloom::tool
