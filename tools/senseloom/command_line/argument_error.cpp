#include "command_line/argument_error.h"

#include <vector>

#include "model/nearest_name.h"

namespace senseloom::tool {
namespace {

std::string withNearest(const std::string& problem, const std::string& name, const std::vector<std::string>& known) {
  const std::string_view nearest = model::nearestName(name, {known.begin(), known.end()});
  return problem + " \"" + name + "\"; the nearest is \"" + std::string(nearest) + '"';
}

std::vector<std::string> optionNames(const CLI::App& command) {
  std::vector<std::string> names;
  for (const CLI::Option* option : command.get_options()) {
    for (const std::string& name : option->get_lnames()) names.push_back("--" + name);
    for (const std::string& name : option->get_snames()) names.push_back('-' + name);
  }
  return names;
}

std::vector<std::string> commandNames(const CLI::App& command) {
  std::vector<std::string> names;
  for (const CLI::App* below : command.get_subcommands({})) names.push_back(below->get_name());
  return names;
}

// About the first argument that a command could not take.
std::string unknownArgument(const std::string& whole, const CLI::App& command, const std::string& argument) {
  if (argument.size() > 1 && argument.front() == '-') {
    return withNearest(whole + " has no option", argument.substr(0, argument.find('=')), optionNames(command));
  }
  const auto commands = commandNames(command);
  if (!commands.empty()) return withNearest(whole + " has no command", argument, commands);
  return whole + ": \"" + argument + "\" is one argument too many";
}

}  // namespace

std::string argumentError(const CLI::App* app, const CLI::Error& error) {
  const CLI::App* command = app;
  std::string whole = app->get_name();
  while (!command->get_subcommands().empty()) {
    command = command->get_subcommands().front();
    whole += ' ' + command->get_name();
  }
  const auto cause = static_cast<CLI::ExitCodes>(error.get_exit_code());
  const bool isAboutArguments = cause == CLI::ExitCodes::ExtrasError || cause == CLI::ExitCodes::RequiredError;
  const auto extras = isAboutArguments ? app->remaining(true) : std::vector<std::string>();
  const std::string message =
      extras.empty() ? whole + ": " + error.what() : unknownArgument(whole, *command, extras.front());
  return message + '\n' + whole + " --help tells what can be given.\n";
}

}  // namespace senseloom::tool
