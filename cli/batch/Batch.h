#pragma once

#include "term/ExitCode.h"

class Tool;

namespace batch {

/// Answers the requests on standard input, one JSON object a line, until the input ends, nobody reads the output any
/// more, or a request removes the manager.
/// @throw CommandError (FAULT) if the database, the input or the output fails
[[nodiscard]] ExitCode run(Tool& tool);

} // namespace batch
