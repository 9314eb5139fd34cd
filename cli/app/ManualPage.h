#pragma once

#include "app/CommandLine.h"

/// The sections of the manual page that list options and commands, in mdoc.
[[nodiscard]] std::string manualSections(const CommandLine& line);
