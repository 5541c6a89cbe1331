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

// A folder for one test, which is removed at the end with all that is in it.
class ScratchFolder {
 public:
  explicit ScratchFolder(const std::string& purpose);
  ~ScratchFolder();
  ScratchFolder(const ScratchFolder&) = delete;
  ScratchFolder& operator=(const ScratchFolder&) = delete;

  std::string file(const std::string& fileName) const { return name + '/' + fileName; }
  // The names of the files in it, sorted.
  std::vector<std::string> files() const;

  const std::string name;
};

// What a program needs to be recorded, and the gesture engine's script for the examples.
Environment recordingEnvironment();

// Runs `senseloom record -o FILE -- COMMAND...`, in that environment.
ToolRun recordTo(const std::string& file, std::vector<std::string> command, const std::string& input = "",
                 const Environment& environment = {});

// Records the driven program with these lines on its standard input; `options` are for the recording.
ToolRun recordDriven(const std::string& file, const std::string& lines, std::vector<std::string> options = {});

// Runs `senseloom replay --check FILE`, where the gesture engine itself recognises nothing.
ToolRun check(const std::string& file);

// The calls of a recording, with its notes but without the releases of property lists, and without what is different
// each time: its head and its end, notes about its threads, and the times and threads of its calls.
std::string callsOf(const std::string& recording);

// What `record` says of a recording at its end.
std::string summaryOf(size_t calls, const std::string& file);

}  // namespace senseloom::tool
