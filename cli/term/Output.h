#pragma once

#include <string>
#include <string_view>

/// Standard output, written in large pieces.
///
/// If the reader has closed its end, the rest is dropped.
class Output {
public:
    /// Buffers a text; a full buffer is flushed.
    /// @throw CommandError (FAULT) if the output cannot be written
    void write(std::string_view text);

    /// Writes the buffer.
    /// @throw CommandError (FAULT) if the output cannot be written
    void flush();

    /// Whether the reader has closed its end.
    [[nodiscard]] bool closed() const noexcept { return m_closed; }

private:
    std::string m_buffer;
    bool m_closed = false;
};

/// Writes a text to standard error, with a line end if it has none. On a terminal control characters become `?`.
void writeError(std::string_view line);

/// Writes a text to standard error unchanged.
void writeErrorRaw(std::string_view text);
