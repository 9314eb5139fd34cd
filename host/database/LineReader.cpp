#include "database/LineReader.h"

#include <algorithm>
#include <cstring>
#include <iterator>

// The grammar of database files. All files are parsed here. The scan for the device index only knows enough to
// find plain headers fast, and passes all other files to this reader.

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

/// What is shown of a text for an error that lies somewhere within it.
[[nodiscard]] std::string_view contextAround(std::string_view text, std::size_t offset) noexcept {
    constexpr std::size_t BEFORE = 20;
    return text.substr(offset - std::min(offset, BEFORE));
}

[[nodiscard]] bool startsAfter(std::size_t offset, const SourceSpan& span) noexcept {
    return offset < span.offset;
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
        return {{}, ParseErrorKind::NUL_BYTE, nul, contextAround(line, nul)};
    }
    const std::size_t close = line.find(']');
    if (close == line.npos) {
        return {{}, ParseErrorKind::UNCLOSED_HEADER, 0, line};
    }
    const std::string_view name = line.substr(1, close - 1);
    if (name.empty()) {
        return {{}, ParseErrorKind::EMPTY_NAME, 0, line};
    }
    if (const std::size_t blank = findBlank(name); blank != name.size()) {
        return {{}, ParseErrorKind::BLANK_IN_NAME, 1 + blank, line};
    }
    if (close + 1 != line.size()) {
        return {{}, ParseErrorKind::TEXT_BEHIND_HEADER, close + 1, line};
    }
    return {name, {}, {}, {}};
}

LineReader::LineReader(char* text, std::size_t size)
    : m_next(text), m_end(text + size), m_holdsNul(size != 0 && std::memchr(text, 0, size) != nullptr) {
    m_spans.reserve(expectedLines(size));
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
        // A malformed header must not leave the keys after it to the device before it.
        line.error.closesSection = isHeader;
        const bool isComplete = join(first);
        if (m_text.size() > MAX_LINE_LENGTH) {
            fail(line, ParseErrorKind::LINE_TOO_LONG, 0, m_text);
        } else if (!isComplete) {
            fail(line, ParseErrorKind::CONTINUED_AT_END, m_text.size() - 1, m_text);
        } else if (isHeader) {
            readHeader(line);
        } else {
            readAssignment(line);
        }
        return true;
    }
    return false;
}

/// Takes the next physical line from the text. A CR belongs to the line end only before an LF.
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

/// Joins a line with its continuations, right after its first part: the lines that are consumed leave room
/// enough.
/// @return false when the file ends after a `\`, which the text then includes
bool LineReader::join(const PhysicalLine& first) {
    m_spans.assign(1, {0, first.location});
    char* piece = first.begin;
    char* end = first.end;
    bool isContinued = first.isContinued();
    while (isContinued) {
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
        isContinued = more.isContinued();
        const auto offset = static_cast<std::size_t>(end - first.begin);
        if (offset == m_spans.back().offset) {
            m_spans.pop_back(); // nothing was in it
        }
        // Of a line that is too long the spans are no longer of interest, and could be very many.
        if (offset <= MAX_LINE_LENGTH) {
            m_spans.push_back({static_cast<std::uint32_t>(offset), more.location});
        }
        end = std::copy(more.begin, more.end, end);
    }
    m_text = withoutTrailingBlanks(between(first.begin, end));
    return true;
}

void LineReader::readHeader(Line& line) const {
    const Header header = parseHeader(m_text);
    if (header.name.empty()) {
        fail(line, header.error, header.offset, header.fragment);
        return;
    }
    line.kind = Line::Kind::HEADER;
    line.name = header.name;
    line.location = locationOf(1);
}

void LineReader::readAssignment(Line& line) {
    if (m_holdsNul) {
        if (const std::size_t nul = m_text.find('\0'); nul != m_text.npos) {
            fail(line, ParseErrorKind::NUL_BYTE, nul, contextAround(m_text, nul));
            return;
        }
    }
    const std::size_t equals = m_text.find('=');
    if (equals == m_text.npos) {
        fail(line, ParseErrorKind::NO_EQUALS_SIGN, 0, m_text);
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
        fail(line, ParseErrorKind::EMPTY_KEY, 0, m_text);
        return;
    }
    if (const std::size_t blank = findBlank(key); blank != key.size()) {
        fail(line, ParseErrorKind::BLANK_IN_KEY, blank, key);
        return;
    }
    line.name = key;
    line.location = locationOf(0);
    line.value = withoutBlanks(m_text.substr(equals + 1));
    locateValue(line);
}

/// Makes the spans of the line those of the value; an empty value is located right after the `=`.
void LineReader::locateValue(Line& line) {
    const auto begin = static_cast<std::uint32_t>(line.value.data() - m_text.data());
    const auto end = static_cast<std::uint32_t>(begin + line.value.size());
    if (line.value.empty()) {
        SourceLocation location = locationOf(m_text.find('='));
        ++location.column;
        m_spans.assign(1, {0, location});
        line.spans = m_spans;
        return;
    }
    const SourceLocation location = locationOf(begin);
    const auto after = std::upper_bound(m_spans.begin(), m_spans.end(), begin, startsAfter);
    const auto first = std::prev(after);
    auto last = after;
    *first = {0, location};
    while (last != m_spans.end() && last->offset < end) {
        last->offset -= begin;
        ++last;
    }
    line.spans = {&*first, static_cast<std::size_t>(last - first)};
}

void LineReader::fail(Line& line, ParseErrorKind kind, std::size_t offset, std::string_view fragment) const {
    line.kind = Line::Kind::INVALID;
    line.error.kind = kind;
    line.error.location = locationOf(offset);
    line.error.excerpt = excerpt(fragment);
}

/// The place of a byte of the current line.
SourceLocation LineReader::locationOf(std::size_t offset) const noexcept {
    const SourceSpan& span =
        *std::prev(std::upper_bound(m_spans.begin(), m_spans.end(), offset, startsAfter));
    return {span.location.line, span.location.column + static_cast<std::uint32_t>(offset - span.offset)};
}

} // namespace acd
