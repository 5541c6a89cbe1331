#include "record/child_program.h"

#include <fcntl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <iterator>
#include <utility>

#include "input_error.h"

namespace senseloom::tool {
namespace {

constexpr int kSignals[] = {SIGINT, SIGTERM, SIGHUP, SIGQUIT};

volatile pid_t receiver = 0;

void passSignal(int number, siginfo_t* information, void* /*context*/) {
  const int error = errno;
  if (receiver > 0 && information->si_code <= 0) kill(receiver, number);  // a process sent it
  errno = error;
}

// Only there to end a wait.
void noteEndOfChild(int /*number*/) {}

// A signal that the tool ignores, as under nohup, stays ignored, by the program as well.
struct sigaction before[std::size(kSignals)];

void passSignals() {
  struct sigaction action {};
  action.sa_sigaction = passSignal;
  action.sa_flags = SA_SIGINFO | SA_RESTART;
  for (size_t i = 0; i < std::size(kSignals); ++i) {
    sigaction(kSignals[i], nullptr, &before[i]);
    if (before[i].sa_handler != SIG_IGN) sigaction(kSignals[i], &action, nullptr);
  }
  struct sigaction ended {};
  ended.sa_handler = noteEndOfChild;
  sigaction(SIGCHLD, &ended, nullptr);
}

void restoreSignals() {
  for (size_t i = 0; i < std::size(kSignals); ++i) sigaction(kSignals[i], &before[i], nullptr);
}

class HeldSignals {
 public:
  HeldSignals() {
    sigset_t all;
    sigfillset(&all);
    sigprocmask(SIG_SETMASK, &all, &mask);
  }
  void release() const { sigprocmask(SIG_SETMASK, &mask, nullptr); }

 private:
  sigset_t mask;
};

bool setAll(const ChildProgram::Environment& environment) {
  return std::all_of(environment.begin(), environment.end(), [](const auto& variable) {
    return setenv(variable.first.c_str(), variable.second.c_str(), 1) == 0;
  });
}

// In the child. What goes wrong is told through the pipe, which closes when the program has started.
[[noreturn]] void start(std::vector<char*> arguments, const ChildProgram::Environment& environment, int in, int out,
                        int trouble) {
  const bool hasInput = in == STDIN_FILENO || dup2(in, STDIN_FILENO) >= 0;  // its own may be closed
  if (setAll(environment) && hasInput && dup2(out, STDOUT_FILENO) >= 0) {
    execvp(arguments.front(), arguments.data());
  }
  const int error = errno;
  [[maybe_unused]] const ssize_t count = write(trouble, &error, sizeof error);
  _exit(127);
}

}  // namespace

ChildProgram::ChildProgram(std::vector<std::string> command, const Environment& environment, int in, int out) {
  std::vector<char*> arguments;
  for (std::string& argument : command) arguments.push_back(argument.data());
  arguments.push_back(nullptr);
  int trouble[2];
  if (pipe2(trouble, O_CLOEXEC) != 0) throw InputError(command.front() + ": " + std::strerror(errno));
  passSignals();
  const HeldSignals held;  // until it is known whom to pass them to
  process = fork();
  if (process == 0) {
    restoreSignals();
    held.release();
    start(std::move(arguments), environment, in, out, trouble[1]);
  }
  int error = process < 0 ? errno : 0;
  receiver = process;
  held.release();
  close(trouble[1]);
  if (process > 0 && read(trouble[0], &error, sizeof error) == sizeof error) waitpid(process, nullptr, 0);
  close(trouble[0]);
  if (error != 0) {
    restoreSignals();
    throw InputError(command.front() + ": " + std::strerror(error));
  }
}

bool ChildProgram::hasEnded() {
  if (!isOver && waitpid(process, &waitStatus, WNOHANG) == process) {
    isOver = true;
    receiver = 0;
    restoreSignals();
  }
  return isOver;
}

ExitStatus ChildProgram::status() const {
  if (WIFSIGNALED(waitStatus)) return {0, WTERMSIG(waitStatus)};
  return {WEXITSTATUS(waitStatus)};
}

std::string ChildProgram::cause() const {
  if (!WIFSIGNALED(waitStatus)) return "";
  return std::string("the program was ended by a signal: ") + strsignal(WTERMSIG(waitStatus));
}

}  // namespace senseloom::tool
