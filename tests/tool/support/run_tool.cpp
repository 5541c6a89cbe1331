#include "run_tool.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <memory>
#include <sstream>

namespace senseloom::tool {
namespace {

struct CloseFile {
  void operator()(std::FILE* file) const { std::fclose(file); }
};
using TemporaryFile = std::unique_ptr<std::FILE, CloseFile>;

TemporaryFile makeTemporaryFile(const std::string& content) {
  TemporaryFile file(std::tmpfile());
  if (file == nullptr) {
    std::perror("tmpfile");
    std::abort();
  }
  std::fwrite(content.data(), 1, content.size(), file.get());
  std::rewind(file.get());
  return file;
}

std::string readAll(std::FILE* file) {
  std::string content;
  char buffer[4096];
  std::rewind(file);
  while (const size_t count = std::fread(buffer, 1, sizeof buffer, file)) content.append(buffer, count);
  return content;
}

}  // namespace

ToolRun runTool(std::vector<std::string> arguments, const std::string& input, const Environment& environment) {
  const bool saysWhatToLog = std::find(arguments.begin(), arguments.end(), "--log") != arguments.end();
  if (!arguments.empty() && arguments[0] == "replay" && !saysWhatToLog) {
    arguments.insert(arguments.begin() + 1, {"--log", "none"});
  }
  std::vector<char*> argv{const_cast<char*>("senseloom")};
  for (std::string& argument : arguments) argv.push_back(argument.data());
  argv.push_back(nullptr);

  const TemporaryFile in = makeTemporaryFile(input);
  const TemporaryFile out = makeTemporaryFile("");
  const TemporaryFile err = makeTemporaryFile("");
  const pid_t child = fork();
  if (child == 0) {
    for (const auto& [name, value] : environment) setenv(name.c_str(), value.c_str(), 1);
    if (dup2(fileno(in.get()), STDIN_FILENO) < 0 || dup2(fileno(out.get()), STDOUT_FILENO) < 0 ||
        dup2(fileno(err.get()), STDERR_FILENO) < 0 || chdir(EXAMPLES_FOLDER) != 0) {
      _exit(126);
    }
    execv(TOOL_FILE, argv.data());
    _exit(127);
  }
  int status = 0;
  rusage usage{};
  wait4(child, &status, 0, &usage);
  return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, readAll(out.get()), readAll(err.get()), usage.ru_maxrss};
}

std::string contentOf(const std::string& file) {
  std::ifstream stream(file, std::ios::binary);
  EXPECT_TRUE(stream.is_open()) << file;
  return {std::istreambuf_iterator<char>(stream), {}};
}

std::vector<std::string> sensorNames() {
  const std::string start = R"({"sensor":")";
  std::istringstream objects(runTool({"sensors", "--json"}).out);
  std::vector<std::string> names;
  for (std::string object; std::getline(objects, object);) {
    EXPECT_EQ(object.substr(0, start.size()), start);
    names.push_back(object.substr(start.size(), object.find('"', start.size()) - start.size()));
  }
  EXPECT_GE(names.size(), 12U);
  return names;
}

std::vector<std::string> exampleNames() {
  std::vector<std::string> names;
  for (const auto& entry : std::filesystem::directory_iterator(EXAMPLES_FOLDER)) {
    if (entry.path().extension() == ".jsonl") names.push_back(entry.path().stem());
  }
  std::sort(names.begin(), names.end());
  return names;
}

}  // namespace senseloom::tool
