#pragma once

#include "text/Json.h"

#include <AcdLines.h>

#include <cstddef>
#include <stdexcept>
#include <string>
#include <string_view>

/// The words of the Language Server Protocol: positions, ranges and errors.
namespace lsp {

enum class ErrorCode : int {
    PARSE_ERROR = -32700,
    INVALID_REQUEST = -32600,
    METHOD_NOT_FOUND = -32601,
    INVALID_PARAMS = -32602,
    INTERNAL_ERROR = -32603,
    NOT_INITIALIZED = -32002,
    REQUEST_FAILED = -32803,
    REQUEST_CANCELLED = -32800,
};

/// Ends a request with an error.
class RequestError : public std::runtime_error {
public:
    RequestError(ErrorCode code, const std::string& message) : std::runtime_error(message), m_code(code) {}

    [[nodiscard]] ErrorCode code() const noexcept { return m_code; }

private:
    ErrorCode m_code;
};

/// What the columns of positions count.
enum class Encoding { UTF8, UTF16 };

/// A place in a document, counted from 0.
struct Position {
    std::size_t line = 0;
    std::size_t character = 0;

    friend auto operator<=>(const Position&, const Position&) = default;
};

struct Range {
    Position start;
    Position end;
};

/// The number of code units of a text. A byte that is not UTF-8 is one, as the U+FFFD that editors show for it.
[[nodiscard]] std::size_t unitsOf(std::string_view text, Encoding encoding);

/// The number of bytes that so many units of a line take; the whole line when it has fewer. A position inside a
/// character is that of its start.
[[nodiscard]] std::size_t bytesOf(std::string_view line, std::size_t units, Encoding encoding);

/// The position of a place in a file: line and column are counted from 1, the column in bytes.
[[nodiscard]] Position positionOf(const AcdLines& file, unsigned line, std::size_t column, Encoding encoding);

/// The range of so many bytes of a line.
[[nodiscard]] Range rangeOf(const AcdLines& file, unsigned line, std::size_t column, std::size_t length,
                            Encoding encoding);

/// Counts units of places that come in order: each line is walked over once, however many places it has.
class UnitCounter {
public:
    explicit UnitCounter(Encoding encoding) : m_encoding(encoding) {}

    /// As `positionOf`.
    [[nodiscard]] Position positionOf(const AcdLines& file, unsigned line, std::size_t column);

private:
    Encoding m_encoding;
    const AcdLines* m_file = nullptr;
    unsigned m_line = 0;
    std::size_t m_bytes = 0;
    std::size_t m_units = 0;
};

/// The offset of a position in a text. Positions after the end of a line, or of the text, are at that end.
[[nodiscard]] std::size_t offsetOf(std::string_view text, const Position& position, Encoding encoding);

[[nodiscard]] Json asJson(const Position& position);
[[nodiscard]] Json asJson(const Range& range);

/// @throw RequestError (INVALID_PARAMS) if the value is no position
[[nodiscard]] Position readPosition(const Json& json);
[[nodiscard]] Range readRange(const Json& json);

} // namespace lsp
