#include "command_line/help_format.h"

#include <set>
#include <sstream>
#include <string_view>

#include "command_line/option_value.h"

namespace senseloom::tool {
namespace {

constexpr size_t kWidth = 80;
constexpr size_t kNameWidth = 26;

// The text in lines that fit, the first of them behind `start`, and the others as far to the right.
std::string wrapped(const std::string& text, std::string start, size_t indent) {
  std::string lines;
  std::istringstream paragraphs(text);
  for (std::string paragraph; std::getline(paragraphs, paragraph); start.clear()) {
    std::string line = start + std::string(indent - std::min(indent, start.size()), ' ');
    bool hasWord = false;
    std::istringstream words(paragraph);
    for (std::string word; words >> word;) {
      if (hasWord && line.size() + 1 + word.size() > kWidth) {
        lines += line + '\n';
        line.assign(indent, ' ');
        hasWord = false;
      }
      line += (hasWord ? " " : "") + word;
      hasWord = true;
    }
    lines += line + '\n';
  }
  return lines;
}

// A name, and what it means to the right of it, or below it when it is long.
std::string entry(const std::string& name, const std::string& text) {
  const std::string start = "  " + name;
  if (start.size() + 2 <= kNameWidth) return wrapped(text, start, kNameWidth);
  return start + '\n' + wrapped(text, "", kNameWidth);
}

// In order of their names: the set has them by their addresses.
std::string namesOf(const std::set<CLI::Option*>& options) {
  std::set<std::string> sorted;
  for (const CLI::Option* option : options) sorted.insert(option->get_name());
  std::string names;
  for (const std::string& name : sorted) names += (names.empty() ? "" : ", ") + name;
  return names;
}

}  // namespace

std::string HelpFormat::make_description(const CLI::App* app) const {
  return wrapped(app->get_description(), "", 0);
}

std::string HelpFormat::make_footer(const CLI::App* app) const {
  return wrapped(app->get_footer(), "", 0);
}

std::string HelpFormat::make_subcommand(const CLI::App* command) const {
  return entry(command->get_name(), command->get_description());
}

std::string HelpFormat::make_option(const CLI::Option* option, bool isPositional) const {
  std::string name = option->get_name(isPositional, !isPositional);
  const bool takesValue = option->get_items_expected_max() != 0;
  if (!isPositional && takesValue) name += ' ' + valueName(*option);
  std::string text = option->get_description();
  if (!valueNames(*option).empty()) text += ": " + option->get_type_name().substr(valueName(*option).size() + 2);
  if (!text.empty() && text.back() == '}') text.pop_back();
  if (takesValue && !option->get_default_str().empty()) text += " (" + option->get_default_str() + " if not given)";
  if (option->get_required() && !isPositional) text += " (required)";
  if (!option->get_needs().empty()) text += " (only with " + namesOf(option->get_needs()) + ')';
  if (!option->get_excludes().empty()) text += " (not with " + namesOf(option->get_excludes()) + ')';
  return entry(name, text);
}

}  // namespace senseloom::tool
