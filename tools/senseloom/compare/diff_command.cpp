#include "compare/diff_command.h"

#include <CLI/CLI.hpp>
#include <limits>
#include <memory>

#include "command_line/call_options.h"
#include "compare/trace_diff.h"

namespace senseloom::tool {

void declareDiff(CLI::App& app, Action& action) {
  CLI::App* command = app.add_subcommand("diff", "Compare two traces session by session: calls, options, outcomes.");
  command->footer(
      "The first call of a session is compared with its first call in the other trace, and so on. Outcomes are "
      "compared where both traces have them. Which calls failed, the recordings tell.\n"
      "Exit status: 0 when all is alike; 1 when calls differ or the output cannot be written; 2 for bad input.");
  auto arguments = std::make_shared<DiffArguments>();
  command->add_option("LEFT", arguments->left, "a trace")->required()->type_name("FILE");
  command->add_option("RIGHT", arguments->right, "another trace")->required()->type_name("FILE");
  addFilterOptions(*command, arguments->filter);
  addLimitOption(*command, arguments->most);
  command->add_flag("--json", arguments->json, "print one JSON object per call that differs");
  command->callback(
      [arguments, &action] { action = [arguments](std::FILE* out) { TraceDiff(out, *arguments).run(); }; });
}

}  // namespace senseloom::tool
