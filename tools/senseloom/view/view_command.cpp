#include "view/view_command.h"

#include <CLI/CLI.hpp>
#include <memory>

#include "command_line/call_options.h"
#include "view/view.h"

namespace senseloom::tool {

void declareView(CLI::App& app, Action& action) {
  CLI::App* command = app.add_subcommand("view", "Make a page of a trace, to explore in a browser.");
  command->footer(
      "The page is one file that needs nothing else: no network and no server. It shows the records, what became of "
      "each "
      "for each session and why, and every negotiation.\n"
      "Exit status: 0; 1 when the page cannot be written; 2 for bad input.");
  auto arguments = std::make_shared<ViewArguments>();
  command->add_option("TRACE", arguments->trace, "the trace; - is standard input")->required()->type_name("TRACE");
  command->add_option("-o,--output", arguments->page, "the page; else it is written to standard output")
      ->type_name("FILE");
  addClassNamesOption(*command, arguments->classNames);
  addFilterOptions(*command, arguments->filter);
  command->callback([arguments, &action] { action = [arguments](std::FILE* out) { view(out, *arguments); }; });
}

}  // namespace senseloom::tool
