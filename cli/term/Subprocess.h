#pragma once

#include <cstdint>
#include <string>
#include <vector>

/// The variables of this process, as "NAME=value".
[[nodiscard]] std::vector<std::string> environmentVariables();

/// A run of a program, side by side with this one.
///
/// This is all that the tool knows about processes.
class Subprocess {
public:
    /// Runs this program again.
    /// @param arguments of the command line, without the program's name
    /// @param isSilent drops its standard error; otherwise that is this program's
    /// @throw CommandError (FAULT) if it can't be started
    Subprocess(const std::vector<std::string>& arguments, bool isSilent);

    /// Runs another program.
    /// @param command its name, which is looked for in PATH, and its arguments
    /// @param environment all of its variables, as "NAME=value"
    /// @param isSilent as above
    /// @throw CommandError (FAULT) if it can't be started
    Subprocess(const std::vector<std::string>& command, const std::vector<std::string>& environment,
               bool isSilent);

    /// Waits for the end.
    ~Subprocess();
    Subprocess(const Subprocess&) = delete;
    Subprocess& operator=(const Subprocess&) = delete;

    /// Reads the standard output to its end, and waits. Call it once.
    /// @throw CommandError (FAULT) if the run did not succeed
    [[nodiscard]] std::string output();

    /// Likewise, without an exception.
    /// @return whether the run succeeded
    [[nodiscard]] bool succeeds(std::string& text);

private:
    void start(const std::string& program, const std::vector<std::string>& command,
               const std::vector<std::string>& environment, bool isSilent);
    [[nodiscard]] int wait() noexcept;

    int m_output = -1;            ///< a descriptor
    std::intptr_t m_process = -1; ///< as the system identifies it
};
