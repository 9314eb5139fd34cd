#pragma once

#include "batch/Binding.h"
#include "batch/RequestReader.h"
#include "text/Json.h"

#include <string>

/// A call that is ready to be made.
struct PreparedCall {
    const binding::Call* call = nullptr; ///< null when the request fits no method
    binding::Arguments arguments{};
    std::string fault; ///< why there is no call
};

/// Finds the method, and of overloads the one, that takes the arguments of a request. Key names among the
/// arguments turn into the numbers that they stand for. The request must outlive the call.
[[nodiscard]] PreparedCall prepare(Request& request);

/// Does this call remove the manager, so that nothing may follow it?
[[nodiscard]] bool isShutdown(const binding::Call& call);
