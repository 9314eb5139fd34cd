#pragma once

#include <optional>
#include <string>
#include <string_view>

class Output;

/// Reads standard input line by line, and flushes the output whenever it has to wait.
class InputLines {
public:
    /// What is longer than this is not kept.
    static constexpr std::size_t LONGEST = std::size_t{16} * 1024 * 1024;

    struct Line {
        std::string_view text; ///< without its end; valid until the next line is read
        bool tooLong;          ///< the text was dropped
    };

    explicit InputLines(Output& output) : m_output(output) {}

    /// The next line; nothing at the end of the input, or when it would have to wait and nobody reads the
    /// output any more. What stands behind the last line end counts as a line.
    /// @throw CommandError (FAULT) when the input can't be read
    [[nodiscard]] std::optional<Line> next();

private:
    /// Appends what there is to read, waiting for it. @return false where there is nothing more to wait for
    bool fill();

    Output& m_output;
    std::string m_buffer;
    std::size_t m_start = 0;   ///< of the line
    std::size_t m_scanned = 0; ///< there is no line end between the start and here
    bool m_ended = false;
};
