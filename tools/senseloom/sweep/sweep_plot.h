#pragma once

#include <string>

#include "sweep/sweep_outcome.h"

namespace senseloom::tool {

// A picture of all combinations, by how often they bother the client and how long it waits, as a self-contained SVG
// file. Those that no other beats are joined by a line, numbered and named.
std::string drawSweep(const SweepOutcome& outcome, const std::string& title);

}  // namespace senseloom::tool
