#pragma once

#include "term/ExitCode.h"

#include <CLI/CLI.hpp>

#include <string>
#include <vector>

namespace completion {

/// Writes what may stand in place of the last of these words: one a line, with a description behind a tab where
/// there is one. That is what the completions of all shells are made from.
/// @param parser knows the commands and their options
/// @param words what is typed behind "tarvik", up to where the cursor is
/// @return NO where the name of a file may stand, which the shell knows better
[[nodiscard]] ExitCode complete(const CLI::App& parser, const std::vector<std::string>& words);

} // namespace completion
