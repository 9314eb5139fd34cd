#pragma once

#include "database/ParseError.h"

#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>
#include <vector>

namespace acd {

/// Skipped at the start of a file.
inline constexpr std::string_view BYTE_ORDER_MARK = "\xEF\xBB\xBF";

[[nodiscard]] constexpr bool isBlank(char byte) noexcept { return byte == ' ' || byte == '\t'; }

/// The offset of the first blank; the size of the text when there is none.
[[nodiscard]] constexpr std::size_t findBlank(std::string_view text) noexcept {
    std::size_t offset = 0;
    while (offset != text.size() && !isBlank(text[offset])) {
        ++offset;
    }
    return offset;
}

/// The text without the blanks at its end.
[[nodiscard]] std::string_view withoutTrailingBlanks(std::string_view text) noexcept;

/// How many lines to expect in a text. Memory is reserved by it, as one value may have tens of thousands of lines; what is
/// reserved in vain is never touched.
[[nodiscard]] constexpr std::size_t expectedLines(std::size_t size) noexcept { return size / 16 + 1; }

/// What a header line says: a name, or what is wrong with it.
struct Header {
    std::string_view name; ///< empty for a malformed header
    ParseErrorKind error;  ///< of a malformed header only, as are the following
    std::size_t offset;    ///< of the error in the line
    std::string_view fragment;
};

/// Reads a line that begins with `[` and does not end with a blank.
[[nodiscard]] Header parseHeader(std::string_view line) noexcept;

/// Where a part of a joined text was written.
struct SourceSpan {
    std::uint32_t offset; ///< of its first byte in the text
    SourceLocation location;
};

/// One line of a database file as it is meant: continuations joined, comments and blank lines gone.
struct Line {
    enum class Kind {
        HEADER,     ///< opens the section `name`
        ASSIGNMENT, ///< `name = value`
        APPEND,     ///< `name += value`
        INVALID,    ///< has an error
    };

    Kind kind = Kind::INVALID;
    std::string_view name;
    SourceLocation location{}; ///< of the name
    std::string_view value;
    std::span<const SourceSpan> spans; ///< of the value, in order; one at least
    ParseError error{};                ///< of kind `INVALID` only
};

/// Walks over the text of a database file, line by line as they are meant. The one place that knows the
/// grammar.
///
/// The kind of a line is decided by its first physical line: a comment (`#`) is never
/// continued, any other line is after a `\`, and a continuation is never a comment or a header.
class LineReader {
public:
    static constexpr std::size_t MAX_LINE_LENGTH = std::size_t{16} << 20;

    /// The text is changed: continued lines are joined in place, so that a value is one view into it. It
    /// must outlive the lines.
    /// @param size at most 4 GiB
    LineReader(char* text, std::size_t size);

    /// Reads the next line. Its spans are valid until the next call.
    /// @return false at the end of the text
    [[nodiscard]] bool next(Line& line);

    /// How many lines of the text were taken so far: the number of the last one of the line read last.
    [[nodiscard]] std::uint32_t lineNumber() const noexcept { return m_lineNumber; }

private:
    struct PhysicalLine {
        char* begin; ///< its first byte that is no blank
        char* end;
        SourceLocation location; ///< of `begin`

        /// Of a line that holds anything.
        [[nodiscard]] bool isContinued() const noexcept { return end[-1] == '\\'; }
    };

    [[nodiscard]] PhysicalLine takePhysicalLine() noexcept;
    [[nodiscard]] bool join(const PhysicalLine& first);
    void readHeader(Line& line) const;
    void readAssignment(Line& line);
    void locateValue(Line& line);
    void fail(Line& line, ParseErrorKind kind, std::size_t offset, std::string_view fragment) const;
    [[nodiscard]] SourceLocation locationOf(std::size_t offset) const noexcept;

    char* m_next;
    char* m_end;
    std::uint32_t m_lineNumber = 0;
    bool m_holdsNul;

    std::string_view m_text;         ///< the current line, joined, without blanks at its ends
    std::vector<SourceSpan> m_spans; ///< of that line; after it was read, those of its value
};

} // namespace acd
