#include "convert/convert_command.h"

#include <CLI/CLI.hpp>
#include <memory>
#include <string>

#include "command_line/option_value.h"
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
      "a row, dispatched to the sensor; times are rounded to milliseconds, unless their unit is shorter.\n"
      "Exit status: 0; 1 when the output cannot be written; 2 for bad input.");
  auto arguments = std::make_shared<ConvertArguments>();
  command->add_option("FILE", arguments->file, "the table; - is standard input")->required()->type_name("FILE");
  command->add_option("--from", arguments->from, "what the table is written as: csv")
      ->required()
      ->type_name("FORMAT")
      ->check(oneOf({"csv"}));
  command
      ->add_option("--columns", arguments->columns,
                   "the names of the columns, as in time=t,class=decision,truth=truth,recording=recording")
      ->type_name("COLUMNS")
      ->capture_default_str();
  command->add_option("--sensor", arguments->sensor, "the sensor whose records are made")
      ->type_name("SENSOR")
      ->capture_default_str();
  command->add_option("--time-unit", arguments->timeUnit, "of the times in the table")
      ->type_name("UNIT:{s,ms,us,ns}")
      ->capture_default_str();
  command
      ->add_option("-o,--output", arguments->folder,
                   "the folder for one trace a recording, named after it; else one trace is written to standard output")
      ->type_name("FOLDER");
  command->callback([arguments, &action] { action = [arguments](std::FILE* out) { convert(out, *arguments); }; });
}

}  // namespace senseloom::tool
