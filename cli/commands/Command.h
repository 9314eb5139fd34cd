#pragma once

#include "commands/ArgumentList.h"
#include "term/ExitCode.h"

#include <functional>

class Tool;

/// What a command does once its arguments are read.
using Action = std::function<ExitCode(Tool&)>;

/// One command of the tool.
struct Command {
    const char* name;
    const char* summary;  ///< one line without a full stop
    const char* details;  ///< sentences below the summary; may be empty
    const char* examples; ///< one a line

    /// Appends the command's arguments. The action keeps what they are stored in.
    Action (*declare)(ArgumentList& arguments);
};
