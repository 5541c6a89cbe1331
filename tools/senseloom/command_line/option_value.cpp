#include "command_line/option_value.h"

#include <algorithm>
#include <charconv>
#include <string_view>

#include "model/nearest_name.h"

namespace senseloom::tool {
namespace {

template <class Number>
bool isNumber(const std::string& text, Number least, Number most) {
  Number value{};
  const char* end = text.data() + text.size();
  const auto [stop, error] = std::from_chars(text.data(), end, value);
  return error == std::errc() && stop == end && value >= least && value <= most;
}

std::string joined(const std::vector<std::string>& names, const char* between) {
  std::string text;
  for (const std::string& name : names) text += (text.empty() ? "" : between) + name;
  return text;
}

}  // namespace

CLI::Validator wholeNumber(uint64_t least, uint64_t most) {
  return CLI::Validator(
      [least, most](std::string& text) -> std::string {
        if (isNumber(text, least, most)) return "";
        return '"' + text + "\" is not a whole number from " + std::to_string(least) + " to " + std::to_string(most);
      },
      "");
}

CLI::Validator number() {
  return CLI::Validator(
      [](std::string& text) -> std::string {
        return isNumber(text, 0.0, 1e300) ? "" : '"' + text + "\" is not a number from 0 on, such as 12 or 0.5";
      },
      "");
}

CLI::Validator oneOf(std::vector<std::string> names) {
  const std::string description = '{' + joined(names, ",") + '}';
  return CLI::Validator(
      [names = std::move(names)](std::string& text) -> std::string {
        if (std::find(names.begin(), names.end(), text) != names.end()) return "";
        const std::string_view nearest = model::nearestName(text, {names.begin(), names.end()});
        return '"' + text + "\" is none of " + joined(names, ", ") + "; the nearest is " + std::string(nearest);
      },
      description);
}

std::string valueName(const CLI::Option& option) {
  const std::string type = option.get_type_name();
  return type.substr(0, type.find(':'));
}

std::vector<std::string> valueNames(const CLI::Option& option) {
  const std::string type = option.get_type_name();
  const size_t open = type.find(":{");
  if (open == std::string::npos) return {};
  return CLI::detail::split(type.substr(open + 2, type.size() - open - 3), ',');
}

}  // namespace senseloom::tool
