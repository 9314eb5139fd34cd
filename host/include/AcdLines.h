#pragma once

#include <TarvikAbi.h>
#include <tarvik/Attributes.h>

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

/// The logical lines of one database file: continuations joined, blank lines removed, comments separate.
///
/// For tools that show what a file contains and what is wrong with it. Use `AcdReader` to read values.
class TARVIK_HOST_API AcdLines {
public:
    /// What a line is.
    enum class Kind {
        HEADER,     ///< `[name]`
        ASSIGNMENT, ///< `name = value`
        APPEND,     ///< `name += value`
        INVALID,    ///< has an error
    };

    /// What can be wrong with a line.
    enum class ParseError {
        NONE,               ///< nothing
        NO_EQUALS_SIGN,     ///< neither a header nor an assignment
        EMPTY_KEY,          ///< nothing before the `=`
        BLANK_IN_KEY,       ///< a blank inside the text before the `=`
        NUL_BYTE,           ///< a byte 0 anywhere
        LINE_TOO_LONG,      ///< over 16 MiB, its continuations joined
        CONTINUED_AT_END,   ///< `\` at the end of the file
        UNCLOSED_HEADER,    ///< `[` without `]`
        EMPTY_NAME,         ///< `[]`
        BLANK_IN_NAME,      ///< a blank inside a header's name
        TEXT_BEHIND_HEADER, ///< text after the `]`
    };

    /// Where a part of a value was written; lines and columns are counted from 1, columns in bytes.
    struct SourceSpan {
        std::size_t offset; ///< of its first byte in the value
        unsigned line;      ///< of the file
        unsigned column;    ///< of its first byte in that line
    };

    /// A line, its continuations joined.
    struct Line {
        Kind kind;                     ///< what it is
        unsigned firstLine;            ///< the first line of the file that it consists of
        unsigned lastLine;             ///< and the last one
        std::string_view name;         ///< of a section, or the key; empty for an error
        std::string_view value;        ///< empty for headers and errors
        std::vector<SourceSpan> spans; ///< of the value, in order; one at least, even of an empty value
        unsigned line;                 ///< of the file, where the name or the error is
        unsigned column;               ///< of the same
        ParseError error;              ///< `NONE` for all other kinds
        bool closesSection;            ///< a header's error: the keys up to the next header belong to nothing
        std::string text;              ///< what the error is, in words
    };

    /// A comment, from its `#` on.
    struct Comment {
        unsigned line;         ///< of the file
        unsigned column;       ///< of the `#`
        std::string_view text; ///< up to the end of the line
    };

    /// All files of the search path, or all memory files.
    /// @return by family in byte order of the file names, and of a family the bottom layer first; a file that can't be
    ///         read has no lines and a `readError()`, and an info message names it
    [[nodiscard]] static std::vector<AcdLines> ofDatabase();

    /// Parses a text.
    /// @param text the whole file
    /// @param path how the file is shown
    /// @param family the name of its family, as the readers spell it
    explicit AcdLines(std::string_view text, std::string path = {}, std::string family = {});

    AcdLines(const AcdLines&) = delete;
    AcdLines& operator=(const AcdLines&) = delete;

    /// Takes over what was read, with its texts.
    AcdLines(AcdLines&&) noexcept = default;

    /// Takes over what was read, with its texts.
    /// @return this object
    AcdLines& operator=(AcdLines&&) noexcept = default;

    /// @return how the file is shown
    [[nodiscard]] const std::string& path() const noexcept { return m_path; }
    /// @return the name of its family, as the readers spell it
    [[nodiscard]] const std::string& family() const noexcept { return m_family; }

    /// @return why the file can't be read; empty when it was read
    [[nodiscard]] const std::string& readError() const noexcept { return m_readError; }

    /// Files that are never read.
    /// @return the paths of files of the same directory whose names differ from this one's in case alone
    [[nodiscard]] const std::vector<std::string>& caseCollisions() const noexcept { return m_caseCollisions; }

    /// @return the lines in the order of the file; their texts live as long as this object, wherever it is moved
    [[nodiscard]] const std::vector<Line>& lines() const noexcept { return m_lines; }
    /// @return the comments, likewise
    [[nodiscard]] const std::vector<Comment>& comments() const noexcept { return m_comments; }

    /// A physical line of the file.
    /// @param line counted from 1
    /// @return its text without the line end; empty where there is none; lives as long as this object
    [[nodiscard]] std::string_view source(unsigned line) const noexcept;

private:
    friend class AcdFileLines;

    void splitSource();
    void readLines();
    [[nodiscard]] unsigned addComments(unsigned first, unsigned last);

    std::string m_path;
    std::string m_family;
    std::string m_readError;
    std::vector<std::string> m_caseCollisions;
    std::vector<char> m_source; ///< vectors, since their texts stay where they are when they are moved
    std::vector<char> m_joined; ///< the same bytes with continuations joined: what the lines' texts are
    std::vector<std::size_t> m_starts; ///< of the lines in the source
    std::vector<Line> m_lines;
    std::vector<Comment> m_comments;
};
