#include "program_on_terminal.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <regex>

namespace senseloom::tool {
namespace {

constexpr std::chrono::minutes kPatience(1);
constexpr char kTopLeft[] = "\x1b[H";
constexpr char kEraseRest[] = "\x1b[J";

}  // namespace

ProgramOnTerminal::ProgramOnTerminal(std::vector<std::string> command, const Environment& environment, bool hasPipe)
    : terminal(posix_openpt(O_RDWR | O_NOCTTY | O_CLOEXEC)) {
  grantpt(terminal);
  unlockpt(terminal);
  programsEnd = open(ptsname(terminal), O_RDWR | O_NOCTTY | O_CLOEXEC);
  const winsize size{.ws_row = 24, .ws_col = 80, .ws_xpixel = 0, .ws_ypixel = 0};
  ioctl(terminal, TIOCSWINSZ, &size);
  tcgetattr(programsEnd, &before);
  int ends[2];
  if (programsEnd < 0 || pipe2(ends, O_CLOEXEC) != 0) std::abort();
  std::vector<char*> arguments;
  for (std::string& argument : command) arguments.push_back(argument.data());
  arguments.push_back(nullptr);
  process = fork();
  if (process == 0) {
    setsid();
    ioctl(programsEnd, TIOCSCTTY, 0);
    setenv("TERM", "xterm", 1);
    for (const auto& [name, value] : environment) setenv(name.c_str(), value.c_str(), 1);
    dup2(hasPipe ? ends[0] : programsEnd, STDIN_FILENO);
    dup2(programsEnd, STDOUT_FILENO);
    dup2(programsEnd, STDERR_FILENO);
    execv(arguments.front(), arguments.data());
    _exit(127);
  }
  close(ends[0]);
  pipeEnd = ends[1];
}

ProgramOnTerminal::~ProgramOnTerminal() {
  if (process != 0) {
    kill(process, SIGKILL);
    waitpid(process, nullptr, 0);
  }
  endInput();
  close(terminal);
  close(programsEnd);
}

void ProgramOnTerminal::tell(const std::string& line) const {
  const std::string whole = line + '\n';
  EXPECT_EQ(write(pipeEnd, whole.data(), whole.size()), static_cast<ssize_t>(whole.size()));
}

void ProgramOnTerminal::endInput() {
  if (pipeEnd >= 0) close(pipeEnd);
  pipeEnd = -1;
}

void ProgramOnTerminal::press(const std::string& keys) const {
  EXPECT_EQ(write(terminal, keys.data(), keys.size()), static_cast<ssize_t>(keys.size()));
}

std::string ProgramOnTerminal::screenWith(const std::string& wanted) {
  const auto end = std::chrono::steady_clock::now() + kPatience;
  while (screen().find(wanted) == std::string::npos) {
    if (std::chrono::steady_clock::now() > end) {
      ADD_FAILURE() << "no screen with \"" << wanted << "\", but:\n" << text;
      break;
    }
    read();
  }
  return screen();
}

int ProgramOnTerminal::finish() {
  const auto end = std::chrono::steady_clock::now() + kPatience;
  int status = 0;
  pid_t ended = 0;
  while (ended == 0 && std::chrono::steady_clock::now() < end) {
    ended = waitpid(process, &status, WNOHANG);
    read();
  }
  EXPECT_EQ(ended, process) << text;
  if (ended == process) process = 0;
  return status;
}

bool ProgramOnTerminal::isTerminalAsBefore() const {
  termios now{};
  tcgetattr(programsEnd, &now);
  return now.c_lflag == before.c_lflag && now.c_iflag == before.c_iflag && now.c_oflag == before.c_oflag &&
         std::memcmp(now.c_cc, before.c_cc, sizeof now.c_cc) == 0;
}

void ProgramOnTerminal::read() {
  pollfd output{.fd = terminal, .events = POLLIN, .revents = 0};
  char bytes[4096];
  if (poll(&output, 1, 100) <= 0) return;
  const ssize_t count = ::read(terminal, bytes, sizeof bytes);
  if (count > 0) text.append(bytes, static_cast<size_t>(count));
}

std::string ProgramOnTerminal::screen() const {
  const size_t end = text.rfind(kEraseRest);
  if (end == std::string::npos) return "";
  const size_t begin = text.rfind(kTopLeft, end);
  static const std::regex kControl("\x1b\\[[0-9;?]*[A-Za-z]|\r");
  return std::regex_replace(text.substr(begin, end - begin), kControl, "");
}

}  // namespace senseloom::tool
