#pragma once

#include "app/CommandLine.h"

namespace completion {

/// Writes the words that may replace the last of these words: one a line, with a description after a tab if there is
/// one. The completions of all shells are made from it.
/// @param words what is typed after "tarvik", up to the cursor
/// @return NO where a file's name is expected, which the shell knows better
[[nodiscard]] ExitCode complete(const CommandLine& line, const std::vector<std::string>& words);

} // namespace completion
