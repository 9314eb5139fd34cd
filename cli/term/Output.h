#pragma once

#include <string>
#include <string_view>

/// Standard output, written in large pieces.
///
/// A reader that has closed its end wanted no more: what is written then is dropped.
class Output {
public:
    /// Keeps a text for the next flush, which is now when much has gathered.
    /// @throw CommandError (FAULT) when the output can't be written
    void write(std::string_view text);

    /// Writes what was kept.
    /// @throw CommandError (FAULT) when the output can't be written
    void flush();

    /// Has the reader closed its end?
    [[nodiscard]] bool closed() const noexcept { return m_closed; }

private:
    std::string m_kept;
    bool m_closed = false;
};

/// Writes a text to standard error, and a line end where the text has none.
void writeError(std::string_view line);

/// Writes a text to standard error as it is.
void writePiece(std::string_view text);
