#include "record/record_command.h"

#include <CLI/CLI.hpp>
#include <limits>
#include <memory>
#include <string>
#include <vector>

#include "command_line/option_value.h"
#include "record/attached_process.h"
#include "record/recorded_program.h"

namespace senseloom::tool {
namespace {

struct RecordArguments {
  RecordingArguments recording;
  pid_t process = 0;
  std::vector<std::string> command;
};

void record(std::FILE* out, const RecordArguments& arguments) {
  if (arguments.process != 0) {
    recordAttached(out, arguments.recording, arguments.process);
  } else {
    runRecorded(out, arguments.recording, arguments.command);
  }
}

}  // namespace

void declareRecord(CLI::App& app, Action& action) {
  CLI::App* command = app.add_subcommand("record", "Run a program with its calls of the library recorded in a trace.");
  command->footer(
      "What follows -- belongs to the program: senseloom record -o FILE -- PROGRAM ARGUMENT...\n"
      "A FILE that ends in .gz or .zst is compressed; - is standard output, and the program's goes to standard error.\n"
      "Exit status: that of the program; 2 when it cannot be started or recorded; 3 when nothing was recorded.");
  auto arguments = std::make_shared<RecordArguments>();
  RecordingArguments& recording = arguments->recording;
  command->add_option("-o,--output", recording.file, "the trace; %p becomes the id of the process")
      ->type_name("FILE")
      ->capture_default_str();
  command->add_flag("--force", recording.force, "replace a file that holds something");
  command->add_option("--max-size", recording.maxSize, "begin another file after so many bytes; 10k, 10M, 10G")
      ->transform(CLI::AsSizeValue(false))
      ->type_name("SIZE");
  auto* follow = command->add_flag("--follow-forks", recording.followForks, "record forked children, too");
  auto* attach = command->add_option("--attach", arguments->process, "record a process that runs, until interrupted")
                     ->check(wholeNumber(1, std::numeric_limits<int32_t>::max()))
                     ->type_name("PID");
  auto* program =
      command->add_option("COMMAND", arguments->command, "the program and its arguments")->type_name("PROGRAM");
  attach->excludes(program)->excludes(follow);
  command->callback([arguments, attach, program, &action] {
    if (attach->empty() && program->empty()) throw CLI::RequiredError("COMMAND");
    arguments->command = program->reduced_results();
    action = [arguments](std::FILE* out) { record(out, *arguments); };
  });
}

}  // namespace senseloom::tool
