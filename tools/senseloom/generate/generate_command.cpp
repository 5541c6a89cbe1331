#include "generate/generate_command.h"

#include <CLI/CLI.hpp>
#include <cstdint>
#include <limits>
#include <memory>

#include "command_line/option_value.h"
#include "generate/commute_generator.h"

namespace senseloom::tool {
namespace {

struct CommuteArguments {
  uint64_t seed = 0;
  uint32_t records = 2400;
};

}  // namespace

void declareGenerate(CLI::App& app, Action& action) {
  CLI::App* generate = app.add_subcommand("generate", "Write a trace.");
  generate->require_subcommand(1);
  CLI::App* command = generate->add_subcommand(
      "commute", "A day's commute: noisy physical activity, and three clients that join and leave.");
  auto arguments = std::make_shared<CommuteArguments>();
  command->add_option("--seed", arguments->seed, "decides everything: the same seed gives the same trace")
      ->required()
      ->type_name("N")
      ->check(wholeNumber(0, std::numeric_limits<uint64_t>::max()));
  command->add_option("--records", arguments->records, "number of records")
      ->type_name("N")
      ->check(wholeNumber(0, std::numeric_limits<uint32_t>::max()))
      ->capture_default_str();
  command->callback([arguments, &action] {
    action = [arguments](std::FILE* out) { CommuteGenerator(out, arguments->seed, arguments->records).write(); };
  });
}

}  // namespace senseloom::tool
