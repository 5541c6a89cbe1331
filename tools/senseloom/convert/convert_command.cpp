#include "convert/convert_command.h"

#include <CLI/CLI.hpp>
#include <memory>
#include <string>

#include "convert/csv_trace.h"
#include "trace/time_unit.h"

namespace senseloom::tool {
namespace {

struct ConvertArguments {
  std::string file;
  std::string from;
  std::string columns = "time=time,class=class";
  std::string sensor = "PHYAC";
  std::string timeUnit = "s";
  std::string folder;
};

void convert(std::FILE* out, const ConvertArguments& arguments) {
  convertCsv(out, {.file = arguments.file,
                   .columns = readColumns(arguments.columns),
                   .sensor = sensorNamed(arguments.sensor),
                   .timeUnit = timeUnitNamed(arguments.timeUnit),
                   .folder = arguments.folder});
}

}  // namespace

void declareConvert(CLI::App& app, Action& action) {
  CLI::App* command = app.add_subcommand("convert", "Make a trace of a table of decisions, such as a classifier's.");
  command->footer(
      "The table has a heading, and a row a decision, in order of time: cells between commas. The trace has a record "
      "a\n"
      "row, dispatched to the sensor; times are rounded to milliseconds, unless their unit is shorter.\n"
      "Exit status: 0; 1 when the output cannot be written; 2 for bad input.");
  auto arguments = std::make_shared<ConvertArguments>();
  command->add_option("FILE", arguments->file, "the table; - is standard input")->required();
  command->add_option("--from", arguments->from, "what the table is written as: csv")
      ->required()
      ->check(CLI::IsMember({"csv"}));
  command
      ->add_option("--columns", arguments->columns,
                   "the names of the columns, as in time=t_s,class=decision,truth=truth,recording=recording")
      ->capture_default_str();
  command->add_option("--sensor", arguments->sensor, "the sensor whose records are made")->capture_default_str();
  command->add_option("--time-unit", arguments->timeUnit, "of the times in the table: s, ms, us or ns")
      ->capture_default_str();
  command->add_option(
      "-o,--output", arguments->folder,
      "the folder for one trace a recording, named after it; else one trace is written to standard output");
  command->callback([arguments, &action] { action = [arguments](std::FILE* out) { convert(out, *arguments); }; });
}

}  // namespace senseloom::tool
