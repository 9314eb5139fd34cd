#pragma once

#include "app/CommandLine.h"

/// The help of the tool, or of a command, with lines that fit standard output as far as their words allow it.
/// @param command null for the tool
[[nodiscard]] std::string helpText(const CommandLine& line, const DeclaredCommand* command);

/// How a command is called: "check [OPTIONS] --mode MODE [DEVICE]".
[[nodiscard]] std::string usageOf(const DeclaredCommand& declared);
