#pragma once

#include <memory>

#include "explain/explanation.h"
#include "trace/call_filter.h"

namespace senseloom::tool {

// Passes on what a filter takes. An output without a filter is returned as it is.
std::unique_ptr<ExplanationOutput> withFilter(std::unique_ptr<ExplanationOutput> output,
                                              const FilterArguments& arguments, const TraceReader& trace);

}  // namespace senseloom::tool
