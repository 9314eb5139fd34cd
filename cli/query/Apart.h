#pragma once

#include <functional>
#include <string>

#include <sys/types.h>

namespace why {

/// Work that is done in a copy of this process, while this process goes on.
class Apart {
public:
    /// @throw CommandError (FAULT) when there can't be such a copy
    explicit Apart(const std::function<std::string()>& work);

    /// Waits for the copy, unless its result was asked for.
    ~Apart();
    Apart(const Apart&) = delete;
    Apart& operator=(const Apart&) = delete;

    /// Waits for the end of the work. To be called once.
    /// @return what it returned
    /// @throw CommandError (FAULT) when the copy came to another end
    [[nodiscard]] std::string result();

private:
    [[nodiscard]] int end() noexcept;

    int m_input = -1;
    pid_t m_child = -1;
};

/// Runs `work` in a copy of this process, so that nothing of what it does to the manager stays.
/// @return what it returned
/// @throw CommandError (FAULT) when there can't be such a copy
[[nodiscard]] std::string apart(const std::function<std::string()>& work);

} // namespace why
