#pragma once

#include <CLI/CLI.hpp>
#include <cstdint>
#include <initializer_list>
#include <string>
#include <vector>

// What the values of options may be, for the parser, for help and for completion. The parser keeps it as a type's name,
// such as "UNIT:{s,ms}".
namespace senseloom::tool {

CLI::Validator wholeNumber(uint64_t least, uint64_t most);
// A number from 0 on.
CLI::Validator number();
// One of these names.
CLI::Validator oneOf(std::vector<std::string> names);

// The name of an option's type.
std::string valueName(const CLI::Option& option);
// The names that its value can be; empty when it can be something else.
std::vector<std::string> valueNames(const CLI::Option& option);

}  // namespace senseloom::tool
