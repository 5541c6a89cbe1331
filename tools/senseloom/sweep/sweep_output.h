#pragma once

#include <cstddef>
#include <cstdio>
#include <span>
#include <string>

#include "sweep/sweep_outcome.h"

namespace senseloom::tool {

// A number with so many decimals; "-" if it is not known.
std::string decimalText(double value, int decimals);

// One row a combination, with a mark where the library does not take a value as it is.
void printSweepTable(std::FILE* out, const SweepOutcome& outcome, std::span<const size_t> rows);

// One JSON object a combination. What is not known is null.
void printSweepJson(std::FILE* out, const SweepOutcome& outcome, std::span<const size_t> rows);

}  // namespace senseloom::tool
