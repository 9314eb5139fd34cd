#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace acd {

/// A place in a file; both are counted from 1, the column in bytes.
struct SourceLocation {
    std::uint32_t line;
    std::uint32_t column;
};

/// What can be wrong with a line.
enum class ParseErrorKind {
    NO_EQUALS_SIGN,
    EMPTY_KEY,
    BLANK_IN_KEY,
    NUL_BYTE,
    LINE_TOO_LONG,
    CONTINUED_AT_END, ///< `\` at the end of the file
    UNCLOSED_HEADER,
    EMPTY_NAME,
    BLANK_IN_NAME,
    TEXT_BEHIND_HEADER,
    VALUE_TOO_LONG, ///< an append that would make a value larger than a file may be
};

/// An error that costs a line.
struct ParseError {
    ParseErrorKind kind;
    bool closesSection; ///< a header's error: the keys up to the next header belong to nothing
    SourceLocation location;
    std::string excerpt; ///< the offending text, printable and shortened
};

/// Says what the error is, in one line without its place.
[[nodiscard]] std::string describe(const ParseError& error);

/// The text with its control bytes as `\x1b`, so that it does no harm on a terminal.
[[nodiscard]] std::string printable(std::string_view text);

/// As `printable`; of a long text the beginning, with `...` behind.
[[nodiscard]] std::string excerpt(std::string_view text);

} // namespace acd
