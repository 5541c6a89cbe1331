#include "generate/generate_command.h"

#include <CLI/CLI.hpp>
#include <cstdint>
#include <memory>

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
      ->check(CLI::NonNegativeNumber);
  command->add_option("--records", arguments->records, "number of records")->capture_default_str();
  command->callback([arguments, &action] {
    action = [arguments](std::FILE* out) { CommuteGenerator(out, arguments->seed, arguments->records).write(); };
  });
}

}  // namespace senseloom::tool
