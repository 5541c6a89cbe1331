#pragma once

#include <cstdio>
#include <functional>

namespace CLI {
class App;
}

namespace senseloom::tool {

// What a command does, printing to `out`. It throws InputError for what is wrong with the user's input, and other
// exceptions when it fails.
using Action = std::function<void(std::FILE* out)>;

// Each room declares its command with a function of this type: adds the command, its arguments and its help to the
// command line, and sets `action` when the command was given. The action runs after the whole line was parsed.
using Declare = void(CLI::App& app, Action& action);

}  // namespace senseloom::tool
