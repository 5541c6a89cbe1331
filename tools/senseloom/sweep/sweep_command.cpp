#include "sweep/sweep_command.h"

#include <CLI/CLI.hpp>
#include <limits>
#include <memory>
#include <string>

#include "command_line/option_value.h"
#include "input_error.h"
#include "sweep/sweep.h"
#include "trace/time_unit.h"

namespace senseloom::tool {
namespace {

// docs/choosing-options.md has these sentences, too.
constexpr char kDefinitions[] =
    "An hour is one of the time that the client's session is open, from the first record to the last.\n"
    "The class of a result with several decisions is that of its last one.\n"
    "A report is a result other than the first whose class differs from the one before.\n"
    "A report is false when it is not class 6 (no majority), every record of its batch is labelled and none of those "
    "labels is its class.\n"
    "A change is a record whose label differs from the last label other than 0.\n"
    "A label lasts up to the last record with it before a record with another label; records with label 0 in between "
    "do not end it.\n"
    "The delay of a change runs from that record's timestamp to that of the first result with the new class while the "
    "label lasts; it is 0 when the last result before the record had that class. The change is missed when there is "
    "none.\n"
    "The median of an even number of delays is the mean of the two in the middle; the 90 % delay is the least that "
    "nine tenths of the delays do not exceed.\n"
    "Right is the share of labelled time in which the last result's class is the label. A label counts until the next "
    "record.\n"
    "Several traces are taken together, each from its start.\n";

constexpr char kFooter[] =
    "Where the truth is a member \"truth\" of a dispatch in the trace, or a file: a row a time and a class, the label "
    "of all records from that time on. 0 or none: not labelled.\n"
    "A part of a trace: senseloom trim cuts it out.\n"
    "Exit status: 0; 1 when the output cannot be written; 2 for bad input, also when the library replaces or refuses "
    "a value: the row has a mark then.";

// "5s", "500 ms" or a number of seconds.
double secondsFrom(const std::string& text) {
  const size_t digits = text.find_first_not_of("0123456789.");
  const size_t name = text.find_first_not_of(' ', digits);
  const int64_t unit = name == std::string::npos ? kSecond : timeUnitNamed(text.substr(name));
  return static_cast<double>(timeFromText(text.substr(0, digits), unit)) / static_cast<double>(kSecond);
}

struct Typed {
  SweepArguments sweep;
  std::string delay;
};

void addClient(CLI::App& command, SweepArguments& arguments) {
  command.add_option("TRACE", arguments.traces, "the traces; - is standard input")->required()->type_name("TRACE");
  auto* session =
      command.add_option("--session", arguments.session, "the client whose option is swept")->type_name("NAME");
  auto* sensor = command.add_option("--sensor", arguments.sensor, "in its place: one more client, on this sensor")
                     ->type_name("SENSOR");
  command.add_option("--option", arguments.option, "what the option of one more client has beside the values of --set")
      ->type_name("JSON")
      ->needs(sensor);
  session->excludes(sensor);
  command
      .add_option("--set", arguments.sets,
                  "the values of one key, as in logN=0..8 or weightVar=-1,1,2; all combinations are tried")
      ->type_name("KEY=VALUES")
      ->required()
      ->allow_extra_args(false);
  command.add_option("--truth", arguments.truthFiles, "what is true, in place of the labels in the trace; one a trace")
      ->type_name("FILE")
      ->allow_extra_args(false);
  command
      .add_option("--time-unit", arguments.timeUnit,
                  "of timestamps and of the times of --truth; else that of the trace, or ms")
      ->type_name("UNIT:{s,ms,us,ns}");
}

void addOutput(CLI::App& command, Typed& typed) {
  SweepArguments& arguments = typed.sweep;
  command.add_option("--sort", arguments.rows.sortedBy, "sort by this figure of --json, the smallest first")
      ->type_name("FIGURE");
  command.add_flag("--reverse", arguments.rows.isReversed, "the other way round");
  command.add_flag("--best", arguments.rows.isFrontOnly,
                   "only combinations that no other beats: none has at most the same delay and false reports, and less "
                   "of one (without truth: reports, and the time that a batch takes)");
  command.add_option("--limit", arguments.rows.most, "print so many rows at most")
      ->type_name("N")
      ->check(wholeNumber(0, std::numeric_limits<uint32_t>::max()));
  command.add_flag("--json", arguments.json, "print one JSON object per combination");
  command.add_option("--plot", arguments.plot, "write a picture of all combinations to this file, as SVG")
      ->type_name("PICTURE");
  command
      .add_option("--at-most-false", arguments.limits.falsePerHour,
                  "recommend the combination with the least delay among those with so many false reports an hour")
      ->type_name("N")
      ->check(number());
  command
      .add_option("--at-most-delay", typed.delay,
                  "recommend the one with the fewest false reports among those with this median delay, such as 5s")
      ->type_name("TIME");
}

}  // namespace

void declareSweep(CLI::App& app, Action& action) {
  CLI::App* command = app.add_subcommand(
      "sweep", "Replay a trace to a client with every combination of option values, and print how it fares.");
  command->footer(std::string(kDefinitions) + kFooter);
  auto typed = std::make_shared<Typed>();
  addClient(*command, typed->sweep);
  addOutput(*command, *typed);
  command->callback([typed, &action] {
    action = [typed](std::FILE* out) {
      if (typed->sweep.session.empty() && typed->sweep.sensor.empty()) {
        throw InputError("sweep needs --session NAME, or --sensor SENSOR for one more client");
      }
      if (!typed->delay.empty()) typed->sweep.limits.delay = secondsFrom(typed->delay);
      sweep(out, typed->sweep);
    };
  });
}

}  // namespace senseloom::tool
