#pragma once

#include <chrono>
#include <cstddef>
#include <functional>
#include <string>
#include <string_view>

/// A progress line on the terminal for long work: shown after one second, redrawn in place, and wiped at the end.
class Progress {
public:
    using Clock = std::function<std::chrono::steady_clock::time_point()>;
    using Write = std::function<void(std::string_view)>;

    /// On standard error; nothing if that is no terminal.
    /// @param task what is being done: "asking for each device"
    explicit Progress(std::string task);

    /// Through `write`, for tests.
    /// @param width the number of columns; 0: nothing is shown
    Progress(std::string task, std::size_t width, Clock clock, Write write);

    ~Progress();
    Progress(const Progress&) = delete;
    Progress& operator=(const Progress&) = delete;

    /// Reports how much of the work is done. Cheap enough to call for each device.
    void reach(std::size_t done, std::size_t total);

private:
    [[nodiscard]] std::string line(std::size_t done, std::size_t total) const;

    std::string m_task;
    std::size_t m_width;
    Clock m_clock;
    Write m_write;
    std::chrono::steady_clock::time_point m_next; ///< when to draw again
    std::size_t m_drawn = 0;                      ///< the columns that are to be wiped
};
