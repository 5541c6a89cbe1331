#include "watch/watch.h"

#include <fcntl.h>
#include <poll.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <filesystem>
#include <optional>
#include <stdexcept>

#include "record/child_program.h"
#include "terminal/interrupt.h"
#include "trace/trace_reader.h"
#include "watch/live_board.h"

namespace senseloom::tool {
namespace {

constexpr int kPatience = 10;  // milliseconds

[[noreturn]] void fail(const char* what) {
  throw std::runtime_error(std::string(what) + ": " + std::strerror(errno));
}

// Records in standard output.
std::vector<std::string> recordingOf(const std::vector<std::string>& program) {
  std::vector<std::string> command{std::filesystem::read_symlink("/proc/self/exe"), "record", "-o", "-", "--"};
  command.insert(command.end(), program.begin(), program.end());
  return command;
}

struct Pipe {
  int readEnd;
  int writeEnd;
};

Pipe makePipe() {
  int ends[2];
  if (pipe2(ends, O_CLOEXEC) != 0) fail("a pipe");
  return {.readEnd = ends[0], .writeEnd = ends[1]};
}

// Of a terminal's keys the program would take some away.
int inputBeside(const LiveBoard& board) {
  if (!board.hasScreen() || isatty(STDIN_FILENO) == 0) return STDIN_FILENO;
  const int nothing = open("/dev/null", O_RDONLY | O_CLOEXEC);
  if (nothing < 0) fail("/dev/null");
  return nothing;
}

// Makes what is written into the pipe the standard input of this program.
void readAsInput(const Pipe& recording) {
  dup2(recording.readEnd, STDIN_FILENO);
  close(recording.readEnd);
  close(recording.writeEnd);
}

}  // namespace

void watchTrace(std::FILE* out, const std::string& file, const FilterArguments& filter) {
  const InterruptMark mark;
  std::optional<LiveBoard> board;
  TraceReader trace(file, TraceReader::printOnStandardError,
                    {.follows = true, .meanwhile = [&board] { board->refresh(); }});
  board.emplace(out, file == "-" ? "standard input" : file);
  board->begin(filter, trace);
  Replayer(*board).replay(trace);
  board->finish();
  if (board->wasQuit()) forgetInterrupt();
}

void watchProgram(std::FILE* out, const std::vector<std::string>& command, const FilterArguments& filter) {
  CallFilter::check(filter);  // before the program runs
  LiveBoard board(out, command.front());
  const Pipe lines = makePipe();
  ChildProgram recording(recordingOf(command), {}, inputBeside(board), lines.writeEnd);
  readAsInput(lines);
  // What there is to remark upon, the recording says.
  TraceReader trace("-", [](const std::string&) {}, {.follows = true, .meanwhile = [&board] { board.refresh(); }});
  board.begin(filter, trace);
  Replayer(board).replay(trace);
  while (!recording.hasEnded()) poll(nullptr, 0, kPatience);
  board.finish();
  throw recording.status();
}

}  // namespace senseloom::tool
