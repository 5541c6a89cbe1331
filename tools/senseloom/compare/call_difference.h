#pragma once

#include <cstdio>
#include <string>
#include <vector>

#include "trace/json.h"
#include "trace/trace_call.h"

// What differs between two calls, in words: for a replay beside its recording, and for two traces.
namespace senseloom::tool {

struct Difference {
  std::string what;  // as in "102 level", or "items[2]"
  std::string left;  // "none" where there is none
  std::string right;
};
using Differences = std::vector<Difference>;

// Compares the outcomes of a call, in the form that recordings have: "returned", "properties" and "result". The sensor
// may be null.
Differences outcomeDifferences(const Sensor* sensor, const json_t* left, const json_t* right);

// Compares two calls on a sensor, and their outcomes where both have one.
Differences callDifferences(const Sensor* sensor, const TraceCall& left, const TraceCall& right);

// Prints them as a table, with what the two sides are called.
void printDifferences(std::FILE* out, const char* left, const char* right, const Differences& differences);
// The same as an array of objects with "what" and a member for each side.
Json differencesJson(const char* left, const char* right, const Differences& differences);

}  // namespace senseloom::tool
