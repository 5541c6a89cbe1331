#include "record/record_command.h"

#include <CLI/CLI.hpp>
#include <memory>
#include <string>
#include <vector>

#include "record/recorded_program.h"

namespace senseloom::tool {
namespace {

struct RecordArguments {
  std::string file = "trace.jsonl";
  std::vector<std::string> command;
};

}  // namespace

void declareRecord(CLI::App& app, Action& action) {
  CLI::App* command =
      app.add_subcommand("record", "Start a program with its calls of the library recorded in a trace.");
  command->footer(
      "What follows -- belongs to the program: senseloom record -o FILE -- PROGRAM ARGUMENT...\n"
      "Exit status: that of the program; 2 when it cannot be started.");
  auto arguments = std::make_shared<RecordArguments>();
  command->add_option("-o,--output", arguments->file, "the trace; an existing file is overwritten")
      ->capture_default_str();
  command->add_option("COMMAND", arguments->command, "the program and its arguments")->required();
  command->callback([arguments, &action] {
    action = [arguments](std::FILE* out) { startRecorded(out, arguments->file, arguments->command); };
  });
}

}  // namespace senseloom::tool
