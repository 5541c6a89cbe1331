#include <fcntl.h>
#include <unistd.h>

#include <CLI/CLI.hpp>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <exception>
#include <stdexcept>
#include <string>

#include "command.h"
#include "convert/convert_command.h"
#include "explain/explain_arguments.h"
#include "generate/generate_command.h"
#include "input_error.h"
#include "record/record_command.h"
#include "replay/replay_command.h"
#include "sensors/sensors_command.h"
#include "sweep/sweep_command.h"

namespace senseloom::tool {
namespace {

// In the order of the help.
constexpr Declare* kCommands[] = {declareReplay,   declareExplain, declareRecord, declareSweep,
                                  declareGenerate, declareConvert, declareSensors};

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

int run(int argc, char** argv) {
  CLI::App app("Shows what libsenseloom makes of a trace of calls, and what can be asked of its sensors.", "senseloom");
  app.set_version_flag("--version", "senseloom " SENSELOOM_VERSION);
  app.require_subcommand(1);
  Action action;
  for (Declare* declare : kCommands) declare(app, action);
  try {
    app.parse(argc, argv);
  } catch (const CLI::ParseError& error) {
    return app.exit(error) == 0 ? 0 : kBadInput;
  }

  std::FILE* out = claimStandardOutput();
  int status = 0;
  try {
    action(out);
  } catch (const InputError& error) {
    status = kBadInput;
    std::fflush(out);  // what came before the error
    std::fprintf(stderr, "senseloom: %s\n", error.what());
  }
  const bool isWritten = std::ferror(out) == 0;
  if (std::fclose(out) != 0 || !isWritten) failOutput();
  return status;
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
