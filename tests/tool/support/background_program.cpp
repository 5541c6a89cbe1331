#include "background_program.h"

#include <fcntl.h>
#include <sys/ioctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <cstdlib>
#include <fstream>

namespace senseloom::tool {

BackgroundProgram::BackgroundProgram(std::vector<std::string> command, const Environment& environment)
    : errors(std::tmpfile()) {
  std::vector<char*> arguments;
  for (std::string& argument : command) arguments.push_back(argument.data());
  arguments.push_back(nullptr);
  int in[2];
  int out[2];
  if (errors == nullptr || pipe2(in, O_CLOEXEC) != 0 || pipe2(out, O_CLOEXEC) != 0) std::abort();
  process = fork();
  if (process == 0) {
    for (const auto& [name, value] : environment) setenv(name.c_str(), value.c_str(), 1);
    dup2(in[0], STDIN_FILENO);
    dup2(out[1], STDOUT_FILENO);
    dup2(fileno(errors), STDERR_FILENO);
    execv(arguments.front(), arguments.data());
    _exit(127);
  }
  close(in[0]);
  close(out[1]);
  input = fdopen(in[1], "w");
  output = fdopen(out[0], "r");
}

BackgroundProgram::~BackgroundProgram() {
  if (process != 0) {
    send(SIGKILL);
    finish();
  }
  std::fclose(output);
  std::fclose(errors);
}

void BackgroundProgram::tell(const std::string& line) {
  std::fputs((line + '\n').c_str(), input);
  std::fflush(input);
}

std::string BackgroundProgram::ask(const std::string& line) {
  tell(line);
  return readLine();
}

void BackgroundProgram::waitUntilItWaits() const {
  int unread = 1;
  while (unread != 0) ioctl(fileno(input), FIONREAD, &unread);
  std::string stat;
  const std::string file = "/proc/" + std::to_string(process) + "/stat";
  while (stat.find(") S ") == std::string::npos) std::getline(std::ifstream(file), stat);
}

std::string BackgroundProgram::readLine() {
  std::string line;
  int character;
  while ((character = std::getc(output)) != EOF && character != '\n') line += static_cast<char>(character);
  return line;
}

void BackgroundProgram::send(int signal) const {
  kill(process, signal);
}

ToolRun BackgroundProgram::finish() {
  std::fclose(input);
  std::string out;
  int character;
  while ((character = std::getc(output)) != EOF) out += static_cast<char>(character);
  int status = 0;
  waitpid(process, &status, 0);
  process = 0;
  std::string err;
  std::rewind(errors);
  while ((character = std::getc(errors)) != EOF) err += static_cast<char>(character);
  return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, out, err, 0};
}

}  // namespace senseloom::tool
