#pragma once

#include <cstdio>
#include <string>
#include <vector>

#include "explain/explanation.h"
#include "plot/replay_plot.h"
#include "trace/call_filter.h"

namespace senseloom::tool {

// How explanations are printed.
struct ExplanationForm {
  ExplanationExtent extent;
  bool json = false;
  FilterArguments filter = {};  // what is printed; the whole trace is explained
  bool follows = false;         // a trace that is still written
};

// Opens a session for each option string, "session 1" on, gives it the string, and explains every negotiation. Throws
// InputError when there is no such sensor or no string and, once everything is explained, when a string is no JSON
// object.
void explainOptions(std::FILE* out, const std::string& sensor, const std::vector<std::string>& options,
                    const ExplanationForm& form);

// Replays a trace and explains every negotiation and what became of the records. Throws InputError as TraceReader and
// Replayer do.
void explainTrace(std::FILE* out, const std::string& file, const ExplanationForm& form, const PlotArguments& plot);

}  // namespace senseloom::tool
