#pragma once

#include <optional>
#include <string>
#include <string_view>

class Output;

/// The lines of standard input. The output is flushed whenever they have to be waited for.
class InputLines {
public:
    /// Longer lines are dropped.
    static constexpr std::size_t MAX_LENGTH = std::size_t{16} * 1024 * 1024;

    struct Line {
        std::string_view text; ///< without its end; valid until the next line is read
        bool tooLong;          ///< the text was dropped
    };

    explicit InputLines(Output& output) : m_output(output) {}

    /// The next line; nothing at the end of the input, or if it would have to wait after the output was closed. Text
    /// after the last line end is a line.
    /// @throw CommandError (FAULT) if the input cannot be read
    [[nodiscard]] std::optional<Line> next();

private:
    /// Appends what there is to read, waiting for it. @return false if nothing can follow
    bool fill();

    Output& m_output;
    std::string m_buffer;
    std::size_t m_start = 0;   ///< of the line
    std::size_t m_scanned = 0; ///< there is no line end between the start and here
    bool m_ended = false;
};
