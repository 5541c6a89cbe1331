#pragma once

#include <CLI/CLI.hpp>

#include "plot/replay_plot.h"
#include "trace/call_filter.h"

// Options that several commands have.
namespace senseloom::tool {

// Which part of a trace is meant: by session, sensor, lines and times.
void addPartOptions(CLI::App& command, FilterArguments& filter);
// Which calls are shown: a part, and the calls that failed.
void addFilterOptions(CLI::App& command, FilterArguments& filter);

// How many differences are printed.
void addLimitOption(CLI::App& command, size_t& most);

// The unit of timestamps, where the trace does not say it.
void addTimeUnitOption(CLI::App& command, std::string& unit);

void addClassNamesOption(CLI::App& command, std::string& names);

// A picture, and the names of classes. Returns the option that asks for a picture.
CLI::Option* addPlotOptions(CLI::App& command, PlotArguments& plot);

}  // namespace senseloom::tool
