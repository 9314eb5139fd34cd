#pragma once

#include "term/ExitCode.h"

#include <functional>
#include <string_view>
#include <vector>

namespace CLI {
class App;
}
class Tool;

/// What a command does once its arguments are read.
using Action = std::function<ExitCode(Tool&)>;

/// One command of the tool.
struct Command {
    const char* name;
    const char* summary;
    const char* examples; ///< shown under --help, one a line

    /// Declares the command's arguments. The action keeps them.
    Action (*declare)(CLI::App& parser);
};

/// All commands, in the order in which the help lists them.
[[nodiscard]] const std::vector<Command>& commands();
