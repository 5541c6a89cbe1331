#include "command_line/call_options.h"

#include <limits>

#include "command_line/option_value.h"

namespace senseloom::tool {

void addFilterOptions(CLI::App& command, FilterArguments& filter) {
  command.add_option("--time-unit", filter.timeUnit, "of timestamps, where the trace does not say it")
      ->type_name("UNIT:{s,ms,us,ns}");
  command.add_option("--session", filter.sessions, "only calls of the session of this name; may be repeated")
      ->type_name("NAME")
      ->allow_extra_args(false);
  command.add_option("--sensor", filter.sensors, "only calls of sessions on this sensor; may be repeated")
      ->type_name("SENSOR")
      ->allow_extra_args(false);
  command.add_option("--from", filter.from, "only from this line of the trace on, or from this time after its start")
      ->type_name("LINE or TIME");
  command.add_option("--to", filter.to, "only up to this line, or up to this time, such as 5.2s")
      ->type_name("LINE or TIME");
  command.add_flag("--failed", filter.failed, "only calls that failed");
}

void addLimitOption(CLI::App& command, size_t& most) {
  command.add_option("--limit", most, "print so many of the calls that differ, and count the others")
      ->type_name("N")
      ->check(wholeNumber(0, std::numeric_limits<uint32_t>::max()));
}

void addClassNamesOption(CLI::App& command, std::string& names) {
  command
      .add_option("--class-names", names,
                  "names of the classes, from class 0 on: A,B,..., or a file with one a line; else those of the trace")
      ->type_name("NAMES or FILE");
}

CLI::Option* addPlotOptions(CLI::App& command, PlotArguments& plot) {
  auto* file = command
                   .add_option("--plot", plot.file,
                               "write a picture of it to this file, as SVG or, if it ends with .png, as PNG")
                   ->type_name("PICTURE");
  addClassNamesOption(command, plot.classNames);
  return file;
}

}  // namespace senseloom::tool
