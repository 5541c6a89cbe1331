#pragma once

#include <CLI/CLI.hpp>
#include <string>

namespace senseloom::tool {

// Help that fits into 80 columns.
class HelpFormat final : public CLI::Formatter {
 public:
  std::string make_description(const CLI::App* app) const override;
  std::string make_footer(const CLI::App* app) const override;
  std::string make_subcommand(const CLI::App* command) const override;
  std::string make_option(const CLI::Option* option, bool isPositional) const override;
};

}  // namespace senseloom::tool
