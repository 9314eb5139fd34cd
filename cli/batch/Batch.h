#pragma once

#include "term/ExitCode.h"
#include "text/Json.h"

#include <functional>
#include <string>
#include <vector>

class Tool;

namespace batch {

/// A call besides the methods of the exported interface.
struct Handler {
    std::string name;
    Json description; ///< as the call `help` lists it

    /// @param arguments an array, or an object of named ones
    /// @throw CommandError for arguments that it does not take
    std::function<Json(const Json& arguments)> invoke;
};

/// Answers the requests on standard input, one JSON object a line, until the input ends, the reader has closed the
/// output, or a request removes the manager.
/// @throw CommandError (FAULT) if the database, the input or the output fails
[[nodiscard]] ExitCode run(Tool& tool, const std::vector<Handler>& handlers);

} // namespace batch
