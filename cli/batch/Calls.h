#pragma once

#include "batch/Binding.h"
#include "batch/RequestReader.h"
#include "text/Json.h"

#include <string>
#include <vector>

/// A call that is ready to be made.
struct PreparedCall {
    const binding::Call* call = nullptr; ///< null if the request fits no method
    binding::Arguments arguments{};
    bool isUnknown = false; ///< no method has this name
    std::string fault;      ///< what is wrong with the arguments
};

/// Finds the method, and of overloads the one, that takes the arguments of a request. Words among the arguments are
/// replaced by their numbers. The request must outlive the call.
[[nodiscard]] PreparedCall prepare(Request& request);

/// Whether this call removes the manager, so that no other may follow.
[[nodiscard]] bool isShutdown(const binding::Call& call);

/// The names of all methods, sorted.
[[nodiscard]] std::vector<std::string> callNames();

/// All methods with the names and types of their arguments and the type of their result.
[[nodiscard]] Json describeCalls();
