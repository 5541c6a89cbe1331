#include <android/log.h>
#include <fcntl.h>
#include <unistd.h>

#include <CLI/CLI.hpp>
#include <cerrno>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <exception>
#include <functional>
#include <map>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "replay/check_output.h"
#include "generate/commute_generator.h"
#include "explain/explain_command.h"
#include "input_error.h"
#include "replay/json_output.h"
#include "sensors/option_data.h"
#include "plot/replay_plot.h"
#include "record/record_command.h"
#include "replay/replay_progress.h"
#include "replay/replayer.h"
#include "sensors/sensors_command.h"
#include "replay/summary_output.h"
#include "replay/table_output.h"
#include "trace/trace_reader.h"

namespace senseloom::tool {
namespace {

constexpr int kFailure = 1;
constexpr int kBadInput = 2;

// What the command line asks for. It is done after the whole line was understood.
using Action = std::function<void(std::FILE* out)>;

const std::map<std::string, int> kLogLevels = {
    {"debug", ANDROID_LOG_DEBUG}, {"info", ANDROID_LOG_INFO},   {"warn", ANDROID_LOG_WARN},
    {"error", ANDROID_LOG_ERROR}, {"none", ANDROID_LOG_SILENT},
};

struct ReplayArguments {
  std::string file;
  bool json = false;
  bool quiet = false;
  bool all = false;
  bool check = false;
  std::string log;
  PlotArguments plot;
};

// The level for all tags in the environment's ANDROID_LOG_TAGS, as in "*:v"; the liblog of a host does not read it.
std::string defaultLogLevel() {
  const char* const tags = std::getenv("ANDROID_LOG_TAGS");
  const char* const all = tags != nullptr ? std::strstr(tags, "*:") : nullptr;
  switch (all != nullptr ? all[2] | 0x20 : '\0') {  // in lower case
    case 'v':
    case 'd':
      return "debug";
    case 'i':
      return "info";
    case 'e':
      return "error";
    case 's':
      return "none";
    default:
      return "warn";  // shows what was rejected, but not each negotiation
  }
}

std::unique_ptr<ReplayObserver> makeOutput(std::FILE* out, const ReplayArguments& arguments, const TraceReader& trace) {
  if (arguments.check) return std::make_unique<CheckOutput>(out, trace);
  if (arguments.json) return std::make_unique<JsonOutput>(out);
  if (arguments.quiet) return std::make_unique<SummaryOutput>(out);
  return std::make_unique<TableOutput>(out, arguments.all);
}

CLI::Option* addPlotOptions(CLI::App& command, PlotArguments& plot) {
  auto* file = command.add_option("--plot", plot.file, "write a picture of it to this file, as SVG");
  command
      .add_option("--class-names", plot.classNames, "names for the classes in the picture, from class 0 on: A,B,...")
      ->delimiter(',')
      ->needs(file);
  return file;
}

void addReplay(CLI::App& app, Action& action) {
  CLI::App* command = app.add_subcommand("replay", "Replay a trace and print what each client receives.");
  command->footer(
      "A trace is JSON Lines, one call of the library a line. Sessions that it leaves open are closed at its end.\n"
      "Exit status: 0, also when calls failed; 1 when --check finds a difference or the output can not be written;\n"
      "2 for bad input.");
  auto arguments = std::make_shared<ReplayArguments>();
  command->add_option("FILE", arguments->file, "the trace; - is standard input")->required();
  auto* json = command->add_flag("--json", arguments->json, "print one JSON object a call and session");
  auto* quiet = command->add_flag("--quiet", arguments->quiet, "print nothing but a summary, one row a client");
  auto* all = command->add_flag("--all", arguments->all, "print the records that delivered nothing, too");
  auto* check = command->add_flag("--check", arguments->check, "compare every result with the recorded one");
  json->excludes(quiet)->excludes(all)->excludes(check);
  quiet->excludes(all)->excludes(check);
  check->excludes(all);
  arguments->log = defaultLogLevel();
  command->add_option("--log", arguments->log, "print log lines from this level on, on standard error")
      ->check(CLI::IsMember({"debug", "info", "warn", "error", "none"}))
      ->capture_default_str();
  addPlotOptions(*command, arguments->plot);
  command->callback([arguments, &action] {
    action = [arguments](std::FILE* out) {
      TraceReader trace(arguments->file);
      __android_log_set_minimum_priority(kLogLevels.at(arguments->log));
      const bool isFilling = !arguments->quiet && !arguments->check;
      const auto output = withProgress(withPlot(makeOutput(out, *arguments, trace), arguments->file, arguments->plot),
                                       trace, out, isFilling);
      Replayer(*output).replay(trace);
    };
  });
}

void addRecord(CLI::App& app, Action& action) {
  CLI::App* command =
      app.add_subcommand("record", "Start a program with its calls of the library recorded in a trace.");
  command->footer(
      "What follows -- belongs to the program: senseloom record -o FILE -- PROGRAM ARGUMENT...\n"
      "Exit status: that of the program; 2 when it can not be started.");
  struct Arguments {
    std::string file = "trace.jsonl";
    std::vector<std::string> command;
  };
  auto arguments = std::make_shared<Arguments>();
  command->add_option("-o,--output", arguments->file, "the trace, overwritten when it exists")->capture_default_str();
  command->add_option("COMMAND", arguments->command, "the program and its arguments")->required();
  command->callback([arguments, &action] {
    action = [arguments](std::FILE* out) { record(out, arguments->file, arguments->command); };
  });
}

struct ExplainArguments {
  std::string subject;
  std::vector<std::string> options;
  bool records = false;
  PlotArguments plot;
};

void addExplain(CLI::App& app, Action& action) {
  CLI::App* command = app.add_subcommand(
      "explain", "Tell whose wish won in each negotiation, what was rejected, and why records did not arrive.");
  command->footer(
      "With a sensor: opens a session for each option string, one after the other, and explains what they negotiate.\n"
      "The reasons are derived beside the library; where it did otherwise, the line says \"unexplained\".\n"
      "Exit status: 0; 1 when the output can not be written; 2 for bad input, an option that is no JSON included.");
  auto arguments = std::make_shared<ExplainArguments>();
  command->add_option("TRACE", arguments->subject, "a trace (- is standard input), or the name of a sensor")
      ->required();
  auto* options = command->add_option("OPTION", arguments->options, "the option string of a session on the sensor");
  command->add_flag("--records", arguments->records, "tell what became of each record, too")->excludes(options);
  addPlotOptions(*command, arguments->plot)->excludes(options);
  command->callback([arguments, &action] {
    action = [arguments](std::FILE* out) {
      if (findOptionDescription(arguments->subject) != nullptr || !arguments->options.empty()) {
        explainOptions(out, arguments->subject, arguments->options);
      } else {
        explainTrace(out, arguments->subject, arguments->records, arguments->plot);
      }
    };
  });
}

void addGenerate(CLI::App& app, Action& action) {
  CLI::App* generate = app.add_subcommand("generate", "Write a trace.");
  generate->require_subcommand(1);
  CLI::App* command = generate->add_subcommand(
      "commute", "A day's commute: noisy physical activity, and three clients that join and leave.");
  struct Arguments {
    uint64_t seed = 0;
    uint32_t records = 2400;
  };
  auto arguments = std::make_shared<Arguments>();
  command->add_option("--seed", arguments->seed, "decides everything: the same seed gives the same trace")
      ->required()
      ->check(CLI::NonNegativeNumber);
  command->add_option("--records", arguments->records, "number of records")->capture_default_str();
  command->callback([arguments, &action] {
    action = [arguments](std::FILE* out) { CommuteGenerator(out, arguments->seed, arguments->records).write(); };
  });
}

void addSensors(CLI::App& app, Action& action) {
  CLI::App* command = app.add_subcommand(
      "sensors", "Print the sensors with their option keys, defaults, ranges, merge rules and properties.");
  struct Arguments {
    std::string sensor;
    bool json = false;
  };
  auto arguments = std::make_shared<Arguments>();
  command->add_option("SENSOR", arguments->sensor, "this sensor alone");
  command->add_flag("--json", arguments->json, "print one JSON object a sensor");
  command->callback([arguments, &action] {
    action = [arguments](std::FILE* out) {
      (arguments->json ? printSensorsJson : printSensors)(out, arguments->sensor);
    };
  });
}

[[noreturn]] void failOutput() {
  throw std::runtime_error(std::string("standard output: ") + std::strerror(errno));
}

// The tool's own output. The library writes a message of its audio bridge to standard output; it goes to standard error
// instead, so that JSON stays JSON.
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
  addReplay(app, action);
  addExplain(app, action);
  addRecord(app, action);
  addGenerate(app, action);
  addSensors(app, action);
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
