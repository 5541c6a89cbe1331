#pragma once

#include <cstdio>
#include <optional>
#include <vector>

#include "explain/merge_derivation.h"
#include "replay/replayer.h"

namespace senseloom::tool {

// Prints what each session asked for under each key, what was made of it, who decided, and the property that the
// library returned for it. Where the library returned something else than was derived, it says so.
void printNegotiation(std::FILE* out, const std::vector<Participant>& participants, const MergeDerivation& derivation,
                      const std::optional<PropertyList>& returned);

}  // namespace senseloom::tool
