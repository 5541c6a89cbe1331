#include "replay/replay_command.h"

#include <android/log.h>

#include <CLI/CLI.hpp>
#include <cstdlib>
#include <cstring>
#include <limits>
#include <map>
#include <memory>
#include <string>
#include <utility>

#include "command_line/call_options.h"
#include "command_line/option_value.h"
#include "plot/replay_plot.h"
#include "replay/check_output.h"
#include "replay/json_output.h"
#include "replay/replay_progress.h"
#include "replay/summary_output.h"
#include "replay/table_output.h"
#include "terminal/interrupt.h"
#include "terminal/shown_output.h"
#include "trace/replayer.h"
#include "trace/trace_reader.h"

namespace senseloom::tool {
namespace {

const std::map<std::string, int> kLogLevels = {
    {"debug", ANDROID_LOG_DEBUG}, {"info", ANDROID_LOG_INFO},   {"warn", ANDROID_LOG_WARN},
    {"error", ANDROID_LOG_ERROR}, {"none", ANDROID_LOG_SILENT},
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

struct ReplayArguments {
  std::string file;
  bool json = false;
  bool quiet = false;
  bool check = false;
  size_t most = std::numeric_limits<size_t>::max();
  TableForm table;
  std::string times;
  FilterArguments filter;
  bool follows = false;
  std::string log = defaultLogLevel();
  PlotArguments plot;
};

std::unique_ptr<ReplayObserver> makeOutput(std::FILE* out, const ReplayArguments& arguments, const TraceReader& trace) {
  if (arguments.check) {
    return std::make_unique<CheckOutput>(out, CheckForm{.json = arguments.json, .most = arguments.most}, trace);
  }
  if (arguments.json) return std::make_unique<JsonOutput>(out);
  if (arguments.quiet) return std::make_unique<SummaryOutput>(out);
  TableForm form = arguments.table;
  if (!arguments.times.empty()) form.times = arguments.times == "clock" ? Times::clock : Times::elapsed;
  form.timeUnit = arguments.filter.unit();
  if (!arguments.plot.classNames.empty()) form.classNames = readClassNames(arguments.plot.classNames);
  return std::make_unique<TableOutput>(out, form, trace);
}

void replay(std::FILE* out, const ReplayArguments& arguments) {
  const InterruptMark mark;
  const auto show = [out, hasPicture = !arguments.plot.file.empty()] { showSoFar(out, hasPicture); };
  TraceReader trace(arguments.file, TraceReader::printOnStandardError,
                    {.follows = arguments.follows, .meanwhile = show});
  __android_log_set_minimum_priority(kLogLevels.at(arguments.log));
  const bool isFilling = !arguments.quiet && !arguments.check;
  auto shown = withFilter(makeOutput(out, arguments, trace), arguments.filter, trace);
  auto drawn = withPlot(std::move(shown), trace, arguments.plot, arguments.filter);
  const auto output = withProgress(std::move(drawn), trace, out, isFilling);
  Replayer(*output).replay(trace);
}

}  // namespace

void declareReplay(CLI::App& app, Action& action) {
  CLI::App* command = app.add_subcommand("replay", "Replay a trace and print what each client receives.");
  command->footer(
      "A trace is JSON Lines, one call of the library a line. Sessions that it leaves open are closed at its end.\n"
      "Exit status: 0, also when calls failed; 1 when --check finds a difference or the output cannot be written; "
      "2 for bad input.");
  auto arguments = std::make_shared<ReplayArguments>();
  command->add_option("FILE", arguments->file, "the trace; - is standard input")->required()->type_name("FILE");
  auto* json = command->add_flag("--json", arguments->json, "print one JSON object per call and session");
  auto* quiet = command->add_flag("--quiet", arguments->quiet, "print only a summary, one row per client");
  auto* all = command->add_flag("--all", arguments->table.all, "print the records that delivered nothing, too");
  auto* check = command->add_flag("--check", arguments->check, "compare every result with the recorded one");
  json->excludes(quiet)->excludes(all);
  quiet->excludes(all)->excludes(check);
  check->excludes(all);
  command->add_option("--log", arguments->log, "print log lines from this level on, on standard error")
      ->type_name("LEVEL")
      ->check(oneOf({"debug", "info", "warn", "error", "none"}))
      ->capture_default_str();
  command->add_flag("--hex", arguments->table.hex, "print records as bytes");
  command->add_option("--times", arguments->times, "print when calls were made, where the trace tells")
      ->type_name("TIMES")
      ->check(oneOf({"elapsed", "clock"}));
  addLimitOption(*command, arguments->most);
  addFilterOptions(*command, arguments->filter);
  command->add_flag("--follow", arguments->follows, "wait for more until the recording has its end");
  addPlotOptions(*command, arguments->plot);
  command->callback([arguments, &action] { action = [arguments](std::FILE* out) { replay(out, *arguments); }; });
}

}  // namespace senseloom::tool
