#include "plot/plot_options.h"

#include <CLI/CLI.hpp>

namespace senseloom::tool {

CLI::Option* addPlotOptions(CLI::App& command, PlotArguments& plot) {
  auto* file =
      command.add_option("--plot", plot.file, "write a picture of it to this file, as SVG")->type_name("PICTURE");
  command
      .add_option("--class-names", plot.classNames, "names for the classes in the picture, from class 0 on: A,B,...")
      ->type_name("NAMES")
      ->delimiter(',')
      ->allow_extra_args(false)
      ->needs(file);
  return file;
}

}  // namespace senseloom::tool
