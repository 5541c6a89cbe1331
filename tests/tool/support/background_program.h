#pragma once

#include <sys/types.h>

#include <cstdio>
#include <string>
#include <vector>

#include "run_tool.h"

namespace senseloom::tool {

// A program that runs beside the test, which writes its standard input and reads its standard output and error.
class BackgroundProgram {
 public:
  explicit BackgroundProgram(std::vector<std::string> command, const Environment& environment = {});
  // Ends it, if it has not ended.
  ~BackgroundProgram();
  BackgroundProgram(const BackgroundProgram&) = delete;
  BackgroundProgram& operator=(const BackgroundProgram&) = delete;

  pid_t id() const { return process; }

  void tell(const std::string& line);
  // Gives it a line and waits for the one that it answers.
  std::string ask(const std::string& line);
  // Waits until it has read all that it was told, and waits for more.
  void waitUntilItWaits() const;
  // The next line that it prints.
  std::string readLine();

  void send(int signal) const;
  // Ends its input, and waits for its end.
  ToolRun finish();

 private:
  pid_t process = 0;
  std::FILE* input = nullptr;
  std::FILE* output = nullptr;
  std::FILE* errors = nullptr;
};

}  // namespace senseloom::tool
