#include "database/LineReader.h"

#include <algorithm>
#include <cstring>
#include <iterator>

// The grammar of database files. Nobody else takes a file's text apart; the scan for the device index only
// knows enough to find plain headers fast, and hands whatever is not plain to this reader.

namespace acd {

namespace {

[[nodiscard]] std::string_view withoutBlanks(std::string_view text) noexcept {
    while (!text.empty() && isBlank(text.front())) {
        text.remove_prefix(1);
    }
    return withoutTrailingBlanks(text);
}

[[nodiscard]] std::string_view between(const char* begin, const char* end) noexcept {
    return {begin, static_cast<std::size_t>(end - begin)};
}

/// What is shown of a text for a fault that lies somewhere within it.
[[nodiscard]] std::string_view around(std::string_view text, std::size_t offset) noexcept {
    constexpr std::size_t BEFORE = 20;
    return text.substr(offset - std::min(offset, BEFORE));
}

} // namespace

std::string_view withoutTrailingBlanks(std::string_view text) noexcept {
    while (!text.empty() && isBlank(text.back())) {
        text.remove_suffix(1);
    }
    return text;
}

Header parseHeader(std::string_view line) noexcept {
    if (const std::size_t nul = line.find('\0'); nul != line.npos) {
        return {{}, FaultKind::NUL_BYTE, nul, around(line, nul)};
    }
    const std::size_t close = line.find(']');
    if (close == line.npos) {
        return {{}, FaultKind::UNCLOSED_HEADER, 0, line};
    }
    const std::string_view name = line.substr(1, close - 1);
    if (name.empty()) {
        return {{}, FaultKind::EMPTY_NAME, 0, line};
    }
    if (const std::size_t blank = findBlank(name); blank != name.size()) {
        return {{}, FaultKind::BLANK_IN_NAME, 1 + blank, line};
    }
    if (close + 1 != line.size()) {
        return {{}, FaultKind::TEXT_BEHIND_HEADER, close + 1, line};
    }
    return {name, {}, {}, {}};
}

LineReader::LineReader(char* text, std::size_t size) noexcept
    : m_next(text), m_end(text + size), m_holdsNul(size != 0 && std::memchr(text, 0, size) != nullptr) {
    if (between(m_next, m_end).substr(0, BYTE_ORDER_MARK.size()) == BYTE_ORDER_MARK) {
        m_next += BYTE_ORDER_MARK.size();
    }
}

bool LineReader::next(Line& line) {
    while (m_next != m_end) {
        const PhysicalLine first = takePhysicalLine();
        if (first.begin == first.end || *first.begin == '#') {
            continue;
        }
        const bool isHeader = *first.begin == '[';
        // A malformed header must not leave the keys behind it to the device before it.
        line.fault.closesSection = isHeader;
        const bool isComplete = join(first);
        if (m_text.size() > LONGEST_LINE) {
            fail(line, FaultKind::LINE_TOO_LONG, 0, m_text);
        } else if (!isComplete) {
            fail(line, FaultKind::CONTINUED_AT_END, m_text.size() - 1, m_text);
        } else if (isHeader) {
            readHeader(line);
        } else {
            readAssignment(line);
        }
        return true;
    }
    return false;
}

/// Takes the bytes up to the next line end off the text; a CR counts as part of the line end before LF only.
LineReader::PhysicalLine LineReader::takePhysicalLine() noexcept {
    char* const start = m_next;
    char* end = static_cast<char*>(std::memchr(start, '\n', static_cast<std::size_t>(m_end - start)));
    if (end == nullptr) {
        m_next = end = m_end;
    } else {
        m_next = end + 1;
        if (end != start && end[-1] == '\r') {
            --end;
        }
    }
    char* begin = start;
    while (begin != end && isBlank(*begin)) {
        ++begin;
    }
    return {begin, end, {++m_lineNumber, static_cast<std::uint32_t>(begin - start) + 1}};
}

/// Joins a line with all that it goes on with, right behind its first piece: the lines so used up leave room
/// enough.
/// @return false when the file ends behind a `\`, which the text then shows
bool LineReader::join(const PhysicalLine& first) {
    m_pieces.assign(1, {0, first.place});
    char* piece = first.begin;
    char* end = first.end;
    bool goesOn = first.goesOn();
    while (goesOn) {
        if (m_next == m_end) {
            m_text = between(first.begin, end);
            return false;
        }
        end = piece + withoutTrailingBlanks(between(piece, end - 1)).size();
        piece = end;

        const PhysicalLine more = takePhysicalLine();
        if (more.begin == more.end) {
            break;
        }
        goesOn = more.goesOn();
        const auto offset = static_cast<std::size_t>(end - first.begin);
        if (offset == m_pieces.back().offset) {
            m_pieces.pop_back(); // nothing was in it
        }
        // Of a line that is too long the pieces are no longer of interest, and could be very many.
        if (offset <= LONGEST_LINE) {
            m_pieces.push_back({static_cast<std::uint32_t>(offset), more.place});
        }
        end = std::copy(more.begin, more.end, end);
    }
    m_text = withoutTrailingBlanks(between(first.begin, end));
    return true;
}

void LineReader::readHeader(Line& line) const {
    const Header header = parseHeader(m_text);
    if (header.name.empty()) {
        fail(line, header.fault, header.offset, header.fragment);
        return;
    }
    line.kind = Line::Kind::HEADER;
    line.name = header.name;
    line.place = placeOf(1);
}

void LineReader::readAssignment(Line& line) const {
    if (m_holdsNul) {
        if (const std::size_t nul = m_text.find('\0'); nul != m_text.npos) {
            fail(line, FaultKind::NUL_BYTE, nul, around(m_text, nul));
            return;
        }
    }
    const std::size_t equals = m_text.find('=');
    if (equals == m_text.npos) {
        fail(line, FaultKind::NO_EQUALS_SIGN, 0, m_text);
        return;
    }
    std::string_view key = m_text.substr(0, equals);
    line.kind = Line::Kind::ASSIGNMENT;
    if (!key.empty() && key.back() == '+') {
        line.kind = Line::Kind::APPEND;
        key.remove_suffix(1);
    }
    key = withoutTrailingBlanks(key);
    if (key.empty()) {
        fail(line, FaultKind::EMPTY_KEY, 0, m_text);
        return;
    }
    if (const std::size_t blank = findBlank(key); blank != key.size()) {
        fail(line, FaultKind::BLANK_IN_KEY, blank, key);
        return;
    }
    line.name = key;
    line.place = placeOf(0);
    line.value = withoutBlanks(m_text.substr(equals + 1));
    placeValue(line);
}

/// Gives the value the pieces that it consists of; an empty one stands right behind the `=`.
void LineReader::placeValue(Line& line) const {
    const auto begin = static_cast<std::size_t>(line.value.data() - m_text.data());
    line.pieces.clear();
    if (line.value.empty()) {
        Place place = placeOf(m_text.find('='));
        ++place.column;
        line.pieces.push_back({0, place});
        return;
    }
    line.pieces.push_back({0, placeOf(begin)});
    for (const Piece& piece : m_pieces) {
        if (piece.offset > begin && piece.offset < begin + line.value.size()) {
            line.pieces.push_back({static_cast<std::uint32_t>(piece.offset - begin), piece.place});
        }
    }
}

void LineReader::fail(Line& line, FaultKind kind, std::size_t offset, std::string_view fragment) const {
    line.kind = Line::Kind::FAULT;
    line.fault.kind = kind;
    line.fault.place = placeOf(offset);
    line.fault.fragment = excerpt(fragment);
}

/// The place of a byte of the current line.
Place LineReader::placeOf(std::size_t offset) const noexcept {
    const auto behind =
        std::upper_bound(m_pieces.begin(), m_pieces.end(), offset,
                         [](std::size_t wanted, const Piece& piece) { return wanted < piece.offset; });
    const Piece& piece = *std::prev(behind);
    return {piece.place.line, piece.place.column + static_cast<std::uint32_t>(offset - piece.offset)};
}

} // namespace acd
