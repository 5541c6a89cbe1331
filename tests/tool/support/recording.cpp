#include "recording.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdio>

namespace senseloom::tool {
namespace {

const Environment kGestures{{"SENSELOOM_GESTURE_SCRIPT", "gesture_hmm.script"}};

}  // namespace

ScratchFile::ScratchFile(const std::string& purpose)
    : name(testing::TempDir() + purpose + '_' + std::to_string(getpid())) {
  std::remove(name.c_str());
}

ScratchFile::~ScratchFile() {
  std::remove(name.c_str());
}

Environment recordingEnvironment() {
  Environment environment = kGestures;
#ifdef SANITIZED
  // The sanitizer wants to be loaded first, to see every allocation; what is preloaded here takes none of it away.
  environment.emplace_back("ASAN_OPTIONS", "verify_asan_link_order=0");
#endif
  return environment;
}

ToolRun recordTo(const std::string& file, std::vector<std::string> command, const std::string& input,
                 const Environment& environment) {
  command.insert(command.begin(), {"record", "-o", file, "--"});
  Environment all = recordingEnvironment();
  all.insert(all.end(), environment.begin(), environment.end());
  return runTool(command, input, all);
}

ToolRun check(const std::string& file) {
  return runTool({"replay", "--check", file}, "", kGestures);
}

}  // namespace senseloom::tool
