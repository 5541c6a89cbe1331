#include "trim/trim_command.h"

#include <CLI/CLI.hpp>
#include <memory>
#include <string>

#include "command_line/call_options.h"
#include "trim/trim.h"

namespace senseloom::tool {
namespace {

struct TrimArguments {
  std::string trace;
  std::string file;
  FilterArguments filter;
};

}  // namespace

void declareTrim(CLI::App& app, Action& action) {
  CLI::App* command = app.add_subcommand("trim", "Cut a part out of a trace that replays alone, for a bug report.");
  command->footer(
      "Of the records only those that are wanted stay. So do all opens, options and closes before the end of the part, "
      "of the sensors concerned, since every session has its say in what they negotiate. Which calls failed, the "
      "recording tells; with --failed, sensors without such a call are left out.\n"
      "Exit status: 0; 1 when the output cannot be written; 2 for bad input.");
  auto arguments = std::make_shared<TrimArguments>();
  command->add_option("TRACE", arguments->trace, "the trace; - is standard input")->required()->type_name("FILE");
  command->add_option("-o,--output", arguments->file, "the part; standard output if not given")->type_name("FILE");
  addFilterOptions(*command, arguments->filter);
  command->callback([arguments, &action] {
    action = [arguments](std::FILE* out) { trim(out, arguments->trace, arguments->file, arguments->filter); };
  });
}

}  // namespace senseloom::tool
