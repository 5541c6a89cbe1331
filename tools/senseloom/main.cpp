#include <fcntl.h>
#include <unistd.h>

#include <CLI/CLI.hpp>
#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstring>
#include <exception>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "command.h"
#include "command_line/argument_error.h"
#include "command_line/completion.h"
#include "command_line/help_format.h"
#include "compare/diff_command.h"
#include "convert/convert_command.h"
#include "exit_status.h"
#include "explain/explain_arguments.h"
#include "generate/generate_command.h"
#include "info/info_command.h"
#include "input_error.h"
#include "record/record_command.h"
#include "replay/replay_command.h"
#include "sense/sense_command.h"
#include "sensors/sensors_command.h"
#include "status/status_command.h"
#include "sweep/sweep_command.h"
#include "terminal/interrupt.h"
#include "trim/trim_command.h"
#include "view/view_command.h"
#include "watch/watch_command.h"

namespace senseloom::tool {
namespace {

// In the order of the help.
constexpr Declare* kCommands[] = {declareReplay, declareExplain,  declareView,    declareWatch,  declareRecord,
                                  declareStatus, declareInfo,     declareDiff,    declareTrim,   declareSense,
                                  declareSweep,  declareGenerate, declareConvert, declareSensors};

constexpr int kFailure = 1;
constexpr int kBadInput = 2;

[[noreturn]] void failOutput() {
  throw std::runtime_error(std::string("standard output: ") + std::strerror(errno));
}

// The tool's own output. Standard output becomes another name of standard error from here on: the library writes a
// message of its audio bridge there, which must not get into the tool's JSON.
std::FILE* claimStandardOutput() {
  const int own = fcntl(STDOUT_FILENO, F_DUPFD_CLOEXEC, 0);
  std::FILE* out = own < 0 ? nullptr : fdopen(own, "w");
  if (out == nullptr || dup2(STDERR_FILENO, STDOUT_FILENO) < 0) failOutput();
  std::setvbuf(stdout, nullptr, _IOLBF, BUFSIZ);
  return out;
}

// CLI11 takes an argument in brackets for a list of arguments. So it is given one that does not end in a bracket, and
// the mark is taken off what it made of it.
constexpr char kMark = '\x1a';

std::vector<std::string> markedArguments(int argc, char** argv) {
  std::vector<std::string> arguments(argv + 1, argv + argc);
  for (std::string& argument : arguments) {
    if (argument.size() > 1 && argument.front() == '[' && argument.back() == ']') argument += kMark;
  }
  std::reverse(arguments.begin(), arguments.end());  // as CLI11 wants them
  return arguments;
}

void unmarkValues(CLI::App& app) {
  for (CLI::Option* option : app.get_options()) {
    if (option->get_items_expected_max() == 0) continue;
    option->transform([](std::string value) {
      if (!value.empty() && value.back() == kMark) value.pop_back();
      return value;
    });
  }
  for (CLI::App* command : app.get_subcommands(nullptr)) unmarkValues(*command);
}

// Returns the status with which the tool ends; ends it itself as what it has run did, if that was by a signal.
int endLike(const ExitStatus& ended) {
  if (ended.signal != 0) {
    std::signal(ended.signal, SIG_DFL);
    std::raise(ended.signal);
  }
  return ended.status;
}

int run(int argc, char** argv) {
  CLI::App app("Shows what libsenseloom makes of a trace of calls, and what can be asked of its sensors.", "senseloom");
  app.set_version_flag("--version", "senseloom " SENSELOOM_VERSION);
  app.require_subcommand(1);
  Action action;
  app.formatter(std::make_shared<HelpFormat>());
  app.failure_message(argumentError);
  for (Declare* declare : kCommands) declare(app, action);
  if (argc > 1 && std::strcmp(argv[1], kComplete) == 0) {
    printCompletion(stdout, app, std::vector<std::string>(argv + 2, argv + argc));
    return 0;
  }
  unmarkValues(app);
  try {
    app.parse(markedArguments(argc, argv));
  } catch (const CLI::ParseError& error) {
    return app.exit(error) == 0 ? 0 : kBadInput;
  }

  std::FILE* out = claimStandardOutput();
  ExitStatus ended{0};
  try {
    action(out);
  } catch (const ExitStatus& another) {
    ended = another;
  } catch (const InputError& error) {
    ended.status = kBadInput;
    std::fflush(out);  // what came before the error
    std::fprintf(stderr, "senseloom: %s\n", error.what());
  }
  const bool isWritten = std::ferror(out) == 0;
  if (std::fclose(out) != 0 || !isWritten) failOutput();
  endByInterrupt();
  return endLike(ended);
}

}  // namespace
}  // namespace senseloom::tool

int main(int argc, char** argv) {
  try {
    return senseloom::tool::run(argc, argv);
  } catch (const std::exception& error) {
    std::fprintf(stderr, "senseloom: %s\n", error.what());
    return senseloom::tool::kFailure;
  }
}
