#include "watch/watch_command.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <memory>
#include <string>
#include <vector>

#include "command_line/call_options.h"
#include "watch/watch.h"

namespace senseloom::tool {
namespace {

struct WatchArguments {
  std::string trace;
  std::vector<std::string> program;
  FilterArguments filter;
};

void watch(std::FILE* out, const WatchArguments& arguments) {
  if (arguments.program.empty()) {
    watchTrace(out, arguments.trace, arguments.filter);
  } else {
    watchProgram(out, arguments.program, arguments.filter);
  }
}

}  // namespace

void declareWatch(CLI::App& app, Action& action) {
  CLI::App* command = app.add_subcommand("watch", "Show on a live screen what becomes of each session's records.");
  command->footer(
      "A recording that is still written: senseloom watch TRACE; a program: senseloom watch -- PROGRAM ARGUMENT...\n"
      "Keys: s sorts by the next column, r reverses the order, / filters by a text, p pauses, the arrows move, q "
      "quits. "
      "Without a terminal there is no screen; what became of the records is printed at the end.\n"
      "Exit status: that of the program; without one 0; 2 for bad input.");
  auto arguments = std::make_shared<WatchArguments>();
  auto* trace =
      command->add_option("TRACE", arguments->trace, "the recording; - is standard input")->type_name("TRACE");
  auto* program =
      command->add_option("COMMAND", arguments->program, "behind --: the program to watch, and its arguments")
          ->type_name("PROGRAM");
  addFilterOptions(*command, arguments->filter);
  command->callback([arguments, command, trace, program, &action] {
    if (trace->empty()) throw CLI::RequiredError("TRACE or -- PROGRAM");
    const std::vector<std::string> rest = command->remaining();
    const bool isProgram = std::find(rest.begin(), rest.end(), "--") != rest.end();
    if (!isProgram && !program->empty()) throw CLI::ExtrasError("watch", program->results());
    arguments->program = program->reduced_results();
    // It has taken the place of the trace.
    if (isProgram) arguments->program.insert(arguments->program.begin(), arguments->trace);
    action = [arguments](std::FILE* out) { watch(out, *arguments); };
  });
}

}  // namespace senseloom::tool
