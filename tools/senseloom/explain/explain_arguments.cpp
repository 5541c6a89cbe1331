#include "explain/explain_arguments.h"

#include <CLI/CLI.hpp>
#include <memory>
#include <string>
#include <vector>

#include "command_line/call_options.h"
#include "explain/explain_command.h"
#include "kinds/sensor_table.h"

namespace senseloom::tool {
namespace {

struct ExplainArguments {
  std::string subject;
  std::vector<std::string> options;
  ExplanationForm form;
  PlotArguments plot;
};

void explain(std::FILE* out, const ExplainArguments& arguments) {
  if (findSensor(arguments.subject) != nullptr || !arguments.options.empty()) {
    explainOptions(out, arguments.subject, arguments.options, arguments.form);
  } else {
    explainTrace(out, arguments.subject, arguments.form, arguments.plot);
  }
}

}  // namespace

void declareExplain(CLI::App& app, Action& action) {
  CLI::App* command = app.add_subcommand(
      "explain", "Explain whose request won in each negotiation, what was rejected, and why records did not arrive.");
  command->footer(
      "With a sensor: opens a session for each option string, one after the other, and explains what they negotiate.\n"
      "The reasons are computed independently of the library; where the two disagree, the line says \"unexplained\".\n"
      "Exit status: 0; 1 when the output cannot be written; 2 for bad input, such as an option that is not JSON.");
  auto arguments = std::make_shared<ExplainArguments>();
  command->add_option("TRACE", arguments->subject, "a trace (- is standard input), or the name of a sensor")
      ->required()
      ->type_name("TRACE or SENSOR");
  auto* options = command->add_option("OPTION", arguments->options, "the option string of a session on the sensor");
  ExplanationExtent& extent = arguments->form.extent;
  auto* records = command->add_flag("--records", extent.records, "explain what became of each record, too");
  records->excludes(options);
  auto* all = command->add_flag("--all", extent.all, "of many sessions, print all, and not only what differs");
  command
      ->add_flag("--problems", extent.problems,
                 "print nothing but what was rejected, refused or lost, and what is unexplained")
      ->excludes(records)
      ->excludes(all);
  command->add_flag("--json", arguments->form.json, "print one JSON object per call");
  addFilterOptions(*command, arguments->form.filter);
  command->add_flag("--follow", arguments->form.follows, "wait for more until the recording has its end")
      ->excludes(options);
  addPlotOptions(*command, arguments->plot)->excludes(options);
  command->callback([arguments, options, &action] {
    arguments->options = options->reduced_results();
    action = [arguments](std::FILE* out) { explain(out, *arguments); };
  });
}

}  // namespace senseloom::tool
