#pragma once

#include <AcdLines.h>

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

/// Changes to database files that keep every byte which they do not concern.
namespace edit {

/// A logical line of a file, a comment or a blank line, with all its bytes.
struct Element {
    enum class Kind { BLANK, COMMENT, LINE };

    Kind kind;
    std::string_view source;              ///< its physical lines with their line ends
    const AcdLines::Line* line = nullptr; ///< what the readers make of a LINE; null for the others
};

/// The text of a database file, split as the readers split it and without any loss: the byte-order mark and the
/// elements, one after the other, are the text.
class SourceFile {
public:
    /// @param family the name of its family, as the readers spell it
    SourceFile(std::string text, std::string path, std::string family);
    SourceFile(const SourceFile&) = delete;
    SourceFile& operator=(const SourceFile&) = delete;

    [[nodiscard]] const std::string& text() const noexcept { return m_text; }
    [[nodiscard]] const AcdLines& lines() const noexcept { return m_lines; }
    [[nodiscard]] std::string_view byteOrderMark() const noexcept;
    [[nodiscard]] const std::vector<Element>& elements() const noexcept { return m_elements; }

    /// The end of the file's first line that is not blank: LF, or CR and LF. LF for a file without one.
    [[nodiscard]] std::string_view lineEnd() const noexcept;

    /// Where a place of the file is in its text.
    /// @param line counted from 1; the number of lines + 1 is the end
    /// @param column counted from 1, in bytes
    [[nodiscard]] std::size_t offsetOf(unsigned line, unsigned column) const noexcept;

private:
    std::string m_text;
    AcdLines m_lines;
    std::vector<std::size_t> m_starts; ///< of the physical lines
    std::vector<Element> m_elements;
};

/// Reads a file whole.
/// @throw CommandError (FAULT) if it cannot be read
[[nodiscard]] std::string readFile(const std::string& path);

} // namespace edit
