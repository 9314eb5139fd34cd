#pragma once

#include <stdexcept>

/// How the tool ends.
enum class ExitCode : int {
    YES = 0,   ///< yes, or done
    NO = 1,    ///< no: refused, or not found
    FAULT = 2, ///< the command line, the database or the output is at fault
};

/// Ends a command with a message to the user.
class CommandError : public std::runtime_error {
public:
    CommandError(ExitCode status, const std::string& message)
        : std::runtime_error(message), m_status(status) {}

    [[nodiscard]] ExitCode status() const noexcept { return m_status; }

private:
    ExitCode m_status;
};
