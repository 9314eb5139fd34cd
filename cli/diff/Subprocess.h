#pragma once

#include <string>
#include <vector>

namespace diff {

/// A second run of this program, side by side with this one.
///
/// This is all that the tool knows about processes.
class Subprocess {
public:
    /// @param arguments of the command line, without the program's name
    /// @param isSilent drops its standard error; otherwise that is this program's
    /// @throw CommandError (FAULT) if it can't be started
    Subprocess(const std::vector<std::string>& arguments, bool isSilent);

    /// Waits for the end.
    ~Subprocess();
    Subprocess(const Subprocess&) = delete;
    Subprocess& operator=(const Subprocess&) = delete;

    /// Reads the standard output to its end, and waits. Call it once.
    /// @throw CommandError (FAULT) if the run did not succeed
    [[nodiscard]] std::string output();

private:
    [[nodiscard]] int wait() noexcept;

    int m_output = -1;
    int m_process = -1;
};

} // namespace diff
