#pragma once

#include <fstream>
#include <string>
#include <vector>

#include "recording.h"
#include "run_tool.h"

namespace senseloom::tool {

// A decision of a made-up trace: what was decided, and what was true (0: not labelled).
struct Decided {
  int classNumber;
  int truth = 0;
};

// A trace with a decision each `step` seconds, from 0 on.
inline std::string decisionsEach(int step, const std::vector<Decided>& decisions) {
  std::string trace;
  int time = 0;
  for (const Decided& decided : decisions) {
    trace += R"({"call":"dispatch","sensor":"PHYAC","record":{"timestamp":)" + std::to_string(time * 1000) +
             R"(,"items":[{"class":)" + std::to_string(decided.classNumber) + R"(,"seq":0}]})";
    if (decided.truth != 0) trace += ",\"truth\":" + std::to_string(decided.truth);
    trace += "}\n";
    time += step;
  }
  return trace;
}

inline void write(const ScratchFile& file, const std::string& text) {
  std::ofstream(file.name) << text;
}

// Sweeps a trace, given on standard input.
inline ToolRun sweepOf(const std::string& trace, std::vector<std::string> arguments) {
  arguments.insert(arguments.begin(), {"sweep", "-"});
  return runTool(arguments, trace);
}

// What a sweep prints as JSON about one more client of "PHYAC" with a single option.
inline std::string figuresOf(const std::string& trace, const std::string& key, const std::string& option = "{}") {
  const ToolRun run = sweepOf(trace, {"--json", "--sensor", "PHYAC", "--option", option, "--set", key});
  return run.err + run.out;
}

}  // namespace senseloom::tool
