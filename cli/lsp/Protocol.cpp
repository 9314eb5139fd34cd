// Converts between the protocol's positions and the readers' lines and columns.
#include "lsp/Protocol.h"

#include <AcdText.h>

#include <algorithm>
#include <cstdint>
#include <limits>

namespace lsp {

namespace {

/// A character of a line: its bytes and its code units.
struct Character {
    std::size_t bytes;
    std::size_t units;
};

Character characterAt(std::string_view text, Encoding encoding) {
    const std::size_t length = AcdText::characterLength(text);
    if (length == 0) {
        return {1, encoding == Encoding::UTF8 ? std::string_view("\uFFFD").size() : 1};
    }
    return {length, encoding == Encoding::UTF8 ? length : length == 4 ? std::size_t{2} : std::size_t{1}};
}

/// The line of a text that begins at an offset, without its end.
std::string_view lineAt(std::string_view text, std::size_t start) {
    std::string_view line = text.substr(start, text.find('\n', start) - start);
    line.remove_suffix(line.ends_with('\r') ? 1 : 0);
    return line;
}

std::size_t readNumber(const Json& json) {
    // The protocol has no larger numbers; an editor that means "the end of the line" sends the largest.
    constexpr std::uint64_t MAX = std::numeric_limits<std::int32_t>::max();
    if (!json.is_number_unsigned()) {
        throw RequestError(ErrorCode::INVALID_PARAMS, "a position is not a number that counts from 0");
    }
    return static_cast<std::size_t>(std::min(json.get<std::uint64_t>(), MAX));
}

} // namespace

std::size_t unitsOf(std::string_view text, Encoding encoding) {
    std::size_t units = 0;
    while (!text.empty()) {
        const Character character = characterAt(text, encoding);
        units += character.units;
        text.remove_prefix(character.bytes);
    }
    return units;
}

std::size_t bytesOf(std::string_view line, std::size_t units, Encoding encoding) {
    std::size_t bytes = 0;
    while (bytes < line.size()) {
        const Character character = characterAt(line.substr(bytes), encoding);
        if (character.units > units) {
            break;
        }
        units -= character.units;
        bytes += character.bytes;
    }
    return bytes;
}

Position positionOf(const AcdLines& file, unsigned line, std::size_t column, Encoding encoding) {
    return {line - 1U, unitsOf(file.source(line).substr(0, column - 1), encoding)};
}

Position UnitCounter::positionOf(const AcdLines& file, unsigned line, std::size_t column) {
    const std::string_view source = file.source(line);
    const std::size_t bytes = std::min(column - 1, source.size());
    if (&file != m_file || line != m_line || bytes < m_bytes) {
        m_file = &file;
        m_line = line;
        m_bytes = m_units = 0;
    }
    m_units += unitsOf(source.substr(m_bytes, bytes - m_bytes), m_encoding);
    m_bytes = bytes;
    return {line - 1U, m_units};
}

Range rangeOf(const AcdLines& file, unsigned line, std::size_t column, std::size_t length,
              Encoding encoding) {
    return {positionOf(file, line, column, encoding), positionOf(file, line, column + length, encoding)};
}

std::size_t offsetOf(std::string_view text, const Position& position, Encoding encoding) {
    std::size_t start = 0;
    for (std::size_t line = 0; line < position.line; ++line) {
        const std::size_t end = text.find('\n', start);
        if (end == text.npos) {
            return text.size();
        }
        start = end + 1;
    }
    return start + bytesOf(lineAt(text, start), position.character, encoding);
}

Json asJson(const Position& position) { return {{"line", position.line}, {"character", position.character}}; }

Json asJson(const Range& range) { return {{"start", asJson(range.start)}, {"end", asJson(range.end)}}; }

Position readPosition(const Json& json) {
    return {readNumber(json.at("line")), readNumber(json.at("character"))};
}

Range readRange(const Json& json) { return {readPosition(json.at("start")), readPosition(json.at("end"))}; }

} // namespace lsp
