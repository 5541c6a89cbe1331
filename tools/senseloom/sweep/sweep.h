#pragma once

#include <cstdio>
#include <optional>
#include <string>
#include <vector>

#include "sweep/sweep_outcome.h"

namespace senseloom::tool {

// What the user asks of a sweep.
struct SweepArguments {
  std::vector<std::string> traces;
  std::string session;        // of the traces; empty: one more client
  std::string sensor;         // of one more client
  std::string option = "{}";  // of one more client
  std::vector<std::string> sets;
  std::vector<std::string> truthFiles;  // one a trace; none: the traces hold the truth, if anything does
  std::string timeUnit;                 // empty: the traces'
  RowChoice rows;
  Limits limits;
  bool json = false;
  std::string plot;  // the file; empty: no picture
};

// Replays the traces to a client with each combination of the values, and prints what comes of it. Throws InputError,
// also when all is printed but the library does not take all values as they are.
void sweep(std::FILE* out, const SweepArguments& arguments);

}  // namespace senseloom::tool
