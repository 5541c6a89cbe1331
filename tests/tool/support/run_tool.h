#pragma once

#include <string>
#include <utility>
#include <vector>

namespace senseloom::tool {

struct ToolRun {
  int status;  // exit status, or -1 when a signal ended the tool
  std::string out;
  std::string err;
  long peakKilobytes;  // of memory
};

using Environment = std::vector<std::pair<std::string, std::string>>;

// Runs the built tool in the folder of the examples, with `input` on its standard input. Log lines are switched off for
// `replay`, unless the arguments say which are wanted, since they hold process ids and times.
ToolRun runTool(std::vector<std::string> arguments, const std::string& input = "", const Environment& environment = {});

// The content of a file.
std::string contentOf(const std::string& file);

// The names of all sensors, in the order in which the tool prints them.
std::vector<std::string> sensorNames();

// The names of all example traces, without ".jsonl".
std::vector<std::string> exampleNames();

}  // namespace senseloom::tool
