#include "recording.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <filesystem>
#include <regex>

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

ScratchFolder::ScratchFolder(const std::string& purpose)
    : name(testing::TempDir() + purpose + '_' + std::to_string(getpid())) {
  std::filesystem::remove_all(name);
  std::filesystem::create_directory(name);
}

ScratchFolder::~ScratchFolder() {
  std::filesystem::remove_all(name);
}

std::vector<std::string> ScratchFolder::files() const {
  std::vector<std::string> names;
  for (const auto& entry : std::filesystem::directory_iterator(name)) names.push_back(entry.path().filename());
  std::sort(names.begin(), names.end());
  return names;
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

ToolRun recordDriven(const std::string& file, const std::string& lines, std::vector<std::string> options) {
  options.insert(options.begin(), {"record", "-o", file});
  options.insert(options.end(), {"--", DRIVEN_FILE});
  return runTool(options, lines, recordingEnvironment());
}

ToolRun check(const std::string& file) {
  return runTool({"replay", "--check", file}, "", {{"SENSELOOM_GESTURE_SCRIPT", "/dev/null"}});
}

std::string callsOf(const std::string& recording) {
  static const std::regex kAbout(
      R"re((\{"(format|end|call":"release)":?[^\n]*\n)|(\{"note":[^\n]*,"breach":[^\n]*\n))re");
  static const std::regex kTime(R"re(,"atUs":\d+,"thread":\d+,"tookNs":\d+)re");
  return std::regex_replace(std::regex_replace(recording, kAbout, ""), kTime, "");
}

std::string summaryOf(size_t calls, const std::string& file) {
  return "senseloom: " + std::to_string(calls) + (calls == 1 ? " call" : " calls") + " recorded in " + file + '\n';
}

}  // namespace senseloom::tool
