#include "convert/convert_command.h"

#include <CLI/CLI.hpp>
#include <memory>
#include <string>

#include "command_line/option_value.h"
#include "convert/csv_trace.h"
#include "convert/trace_conversion.h"
#include "input_error.h"
#include "trace/time_unit.h"

namespace senseloom::tool {
namespace {

constexpr char kFormatsHelp[] =
    "--from csv: a table with a heading, and a row a decision, in order of time: cells between commas. The trace has a "
    "record a row, dispatched to the sensor; times are rounded to milliseconds, unless their unit is shorter.\n"
    "--to perfetto: trace events as JSON, for viewers of system traces. --to csv: a table with a row per call and "
    "session, with what became of each record and why. A part of a trace: senseloom trim cuts it out.\n"
    "Exit status: 0; 1 when the output cannot be written; 2 for bad input.";

struct ConvertArguments {
  std::string file;
  std::string from;
  std::string to;
  std::string columns = "time=time,class=class";
  std::string sensor = "PHYAC";
  std::string timeUnit = "s";
  std::string output;
};

void convert(std::FILE* out, const ConvertArguments& arguments) {
  if (!arguments.to.empty()) {
    convertTrace(out, {.trace = arguments.file, .to = arguments.to, .file = arguments.output});
    return;
  }
  if (arguments.from.empty()) throw InputError("--from or --to says what to convert FILE from or to");
  convertCsv(out, {.file = arguments.file,
                   .columns = readColumns(arguments.columns),
                   .sensor = sensorNamed(arguments.sensor),
                   .timeUnit = timeUnitNamed(arguments.timeUnit),
                   .folder = arguments.output});
}

}  // namespace

void declareConvert(CLI::App& app, Action& action) {
  CLI::App* command =
      app.add_subcommand("convert", "Make a trace of a table of decisions, or of a trace what others read.");
  command->footer(kFormatsHelp);
  auto arguments = std::make_shared<ConvertArguments>();
  command->add_option("FILE", arguments->file, "the table or the trace; - is standard input")
      ->required()
      ->type_name("FILE");
  auto* to = command->add_option("--to", arguments->to, "what a trace is converted to: perfetto or csv")
                 ->type_name("FORMAT")
                 ->check(oneOf({"perfetto", "csv"}));
  command->add_option("--from", arguments->from, "what a table is written as: csv")
      ->type_name("FORMAT")
      ->excludes(to)
      ->check(oneOf({"csv"}));
  command
      ->add_option("--columns", arguments->columns,
                   "the names of the columns, as in time=t,class=decision,truth=truth,recording=recording")
      ->type_name("COLUMNS")
      ->excludes(to)
      ->capture_default_str();
  command->add_option("--sensor", arguments->sensor, "the sensor whose records are made")
      ->type_name("SENSOR")
      ->excludes(to)
      ->capture_default_str();
  command->add_option("--time-unit", arguments->timeUnit, "of the times in the table")
      ->type_name("UNIT:{s,ms,us,ns}")
      ->excludes(to)
      ->capture_default_str();
  command
      ->add_option("-o,--output", arguments->output,
                   "with --to: the file; with --from: the folder for one trace a recording, named after it; else "
                   "standard output")
      ->type_name("FOLDER");
  command->callback([arguments, &action] { action = [arguments](std::FILE* out) { convert(out, *arguments); }; });
}

}  // namespace senseloom::tool
