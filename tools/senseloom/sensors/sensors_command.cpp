#include "sensors/sensors_command.h"

#include <CLI/CLI.hpp>
#include <memory>
#include <string>

#include "sensors/sensors_output.h"

namespace senseloom::tool {
namespace {

struct SensorsArguments {
  std::string sensor;
  bool json = false;
};

}  // namespace

void declareSensors(CLI::App& app, Action& action) {
  CLI::App* command = app.add_subcommand(
      "sensors", "Print the sensors: their option keys, properties and record fields, and what each of them means.");
  auto arguments = std::make_shared<SensorsArguments>();
  command->add_option("SENSOR", arguments->sensor, "this sensor alone")->type_name("SENSOR");
  command->add_flag("--json", arguments->json, "print one JSON object per sensor");
  command->callback([arguments, &action] {
    action = [arguments](std::FILE* out) {
      (arguments->json ? printSensorsJson : printSensors)(out, arguments->sensor);
    };
  });
}

}  // namespace senseloom::tool
