#include "info/info_command.h"

#include <CLI/CLI.hpp>
#include <memory>
#include <string>

#include "command_line/call_options.h"
#include "info/trace_info.h"

namespace senseloom::tool {
namespace {

struct InfoArguments {
  std::string trace;
  FilterArguments filter;
  bool json = false;
};

}  // namespace

void declareInfo(CLI::App& app, Action& action) {
  CLI::App* command = app.add_subcommand(
      "info", "Print what a trace holds: where it is from, its calls, what is missing, left open or not released.");
  auto arguments = std::make_shared<InfoArguments>();
  command->add_option("TRACE", arguments->trace, "the trace; - is standard input")->required()->type_name("FILE");
  command->add_flag("--json", arguments->json, "print one JSON object");
  addFilterOptions(*command, arguments->filter);
  command->callback([arguments, &action] {
    action = [arguments](std::FILE* out) { printInfo(out, arguments->trace, arguments->filter, arguments->json); };
  });
}

}  // namespace senseloom::tool
