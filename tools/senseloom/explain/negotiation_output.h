#pragma once

#include <cstdio>
#include <optional>
#include <string>
#include <vector>

#include "model/outcome.h"
#include "trace/replayer.h"

namespace senseloom::tool {

// Prints what each session asked for under each key, what was made of it, who decided, and the property that the
// library returned for it. `names` are those of the participants. Where the library returned something other than
// `expected`, it says so.
void printNegotiation(std::FILE* out, const model::Negotiation& negotiation, const std::vector<std::string>& names,
                      const std::optional<model::PropertyList>& expected, const std::optional<PropertyList>& returned);

}  // namespace senseloom::tool
