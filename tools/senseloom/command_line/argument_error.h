#pragma once

#include <CLI/CLI.hpp>
#include <string>

namespace senseloom::tool {

// The message about a command line that cannot be parsed, with the nearest known name for one that is unknown.
std::string argumentError(const CLI::App* app, const CLI::Error& error);

}  // namespace senseloom::tool
