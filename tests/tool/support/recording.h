#pragma once

#include <string>
#include <vector>

#include "run_tool.h"

namespace senseloom::tool {

// The name of a file for one test. The file, if there is one, is removed at the start and at the end.
class ScratchFile {
 public:
  explicit ScratchFile(const std::string& purpose);
  ~ScratchFile();
  ScratchFile(const ScratchFile&) = delete;
  ScratchFile& operator=(const ScratchFile&) = delete;

  const std::string name;
};

// What a program needs to be recorded, and the gesture engine's script for the examples.
Environment recordingEnvironment();

// Runs `senseloom record -o FILE -- COMMAND...`, in that environment.
ToolRun recordTo(const std::string& file, std::vector<std::string> command, const std::string& input = "",
                 const Environment& environment = {});

// Runs `senseloom replay --check FILE`, with the same gestures.
ToolRun check(const std::string& file);

}  // namespace senseloom::tool
