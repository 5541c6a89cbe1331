#include "status/status_command.h"

#include <CLI/CLI.hpp>
#include <limits>
#include <memory>

#include "command_line/option_value.h"
#include "status/status_output.h"

namespace senseloom::tool {

void declareStatus(CLI::App& app, Action& action) {
  CLI::App* command =
      app.add_subcommand("status", "Print what is in force in a running process that has the recording library.");
  command->footer(
      "The sessions of each sensor, what each asked for last, what was merged of it, and its records so far.\n"
      "Exit status: 0; 2 when there is no such process, or it has not the recording library.");
  auto process = std::make_shared<pid_t>(0);
  command->add_option("PID", *process, "the process")
      ->required()
      ->type_name("PID")
      ->check(wholeNumber(1, std::numeric_limits<pid_t>::max()));
  command->callback([process, &action] { action = [process](std::FILE* out) { printStatus(out, *process); }; });
}

}  // namespace senseloom::tool
