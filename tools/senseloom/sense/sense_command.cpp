#include "sense/sense_command.h"

#include <CLI/CLI.hpp>
#include <array>
#include <memory>
#include <string>
#include <tuple>
#include <vector>

#include "command_line/call_options.h"
#include "sense/sense.h"

namespace senseloom::tool {
namespace {

struct TypedSensing {
  SensingArguments sensing;
  std::vector<std::string> sessions;
  std::vector<std::tuple<std::string, std::string, std::string>> changes;
  std::string units = "mm";
  std::string columns;
  std::string timeUnit;
  std::string labels = "4=1,5=2,7=2";
};

void senseAsTyped(std::FILE* out, TypedSensing& typed) {
  SensingArguments& sensing = typed.sensing;
  sensing.columns = recordingColumns(typed.units, typed.columns, typed.timeUnit);
  sensing.labels = labelClasses(typed.labels);
  for (const std::string& session : typed.sessions) sensing.clients.push_back(sensingClient(session));
  for (const auto& [time, session, option] : typed.changes) {
    sensing.changes.push_back(sensingChange(time, session, option));
  }
  sense(out, sensing);
}

void addRecordingOptions(CLI::App& command, TypedSensing& typed) {
  command
      .add_option("RECORDING", typed.sensing.recordings,
                  "the recordings, one after another; - is standard input. Plain or compressed by gzip")
      ->required()
      ->type_name("FILE");
  command.add_option("--units", typed.units, "of the columns: ms, mm/s^2, mrad/s and Pa, or s, m/s^2, rad/s and hPa")
      ->type_name("UNITS:{mm,si}")
      ->capture_default_str();
  command
      .add_option("--columns", typed.columns,
                  "the names of columns, as in time=seconds,ax=x,ay=y,az=z; there are gx, gy, gz, pressure, class and "
                  "recording, too")
      ->type_name("COLUMNS");
  command.add_option("--time-unit", typed.timeUnit, "of the times, if it is another")->type_name("UNIT:{s,ms,us,ns}");
  command.add_option("--labels", typed.labels, "the class of a label in the column \"class\", if it is another")
      ->type_name("LABELS")
      ->capture_default_str();
}

}  // namespace

void declareSense(CLI::App& app, Action& action) {
  CLI::App* command =
      app.add_subcommand("sense", "Sense from a recording of a phone's sensors, and write the trace of what happens.");
  command->footer(
      "A recording is a table with a heading: the time, the acceleration and, for GSPX, DTWGS and PDR, the angular "
      "rate "
      "(columns t_ms,ax_mm_s2,ay_mm_s2,az_mm_s2,gx_mrad_s,gy_mrad_s,gz_mrad_s), 20 to 200 samples a second. A sensor "
      "hub "
      "makes records of it, as the clients' options ask for together. The library passes them to the clients.\n"
      "Exit status: 0; 1 when the output cannot be written; 2 for bad input.");
  auto typed = std::make_shared<TypedSensing>();
  addRecordingOptions(*command, *typed);
  command
      ->add_option("--session", typed->sessions,
                   "a client: NAME=SENSOR or NAME=SENSOR:OPTION, as in 'nav=PHYAC:{\"mode\":1,\"logN\":3}'")
      ->required()
      ->type_name("CLIENT")
      ->allow_extra_args(false);
  command
      ->add_option(
          "--at", typed->changes,
          "at that time of the recording, such as 30s, the client's option changes, or its session is closed if "
          "OPTION is close")
      ->type_name("TIME NAME OPTION")
      ->allow_extra_args(false);
  command->add_option("-o,--output", typed->sensing.output, "the trace; else it is written to standard output")
      ->type_name("FILE");
  addPlotOptions(*command, typed->sensing.plot);
  command->callback([typed, &action] { action = [typed](std::FILE* out) { senseAsTyped(out, *typed); }; });
}

}  // namespace senseloom::tool
