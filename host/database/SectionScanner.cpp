#include "database/SectionScanner.h"

#include "database/LineReader.h"

#include <algorithm>
#include <cstring>

// The fast search for headers: from one `[` to the next, and a look at the line around it. Where more than
// that line matters (one that is continued, or one that may itself be a continuation) the file is left
// to the full reader, so that the two can't disagree.

namespace acd {

namespace {

/// Takes the line end off, if there is one.
[[nodiscard]] std::string_view withoutLineEnd(std::string_view line) noexcept {
    if (line.empty() || line.back() != '\n') {
        return line;
    }
    line.remove_suffix(1);
    if (!line.empty() && line.back() == '\r') {
        line.remove_suffix(1);
    }
    return line;
}

/// Whether the last of these lines, comment or not, ends in a `\`.
[[nodiscard]] bool endInBackslash(std::string_view lines) noexcept {
    lines = withoutLineEnd(lines);
    return !lines.empty() && lines.back() == '\\';
}

} // namespace

SectionScanner::SectionScanner(std::size_t bufferSize)
    : m_bufferSize(bufferSize), m_buffer(makeBuffer(bufferSize)) {}

PackedStrings SectionScanner::names(const std::function<std::unique_ptr<ByteSource>()>& open) {
    m_names.clear();
    if (!scan(*open())) {
        m_names.clear();
        parse(*open());
    }
    return m_names.pack();
}

/// Scans a file buffer by buffer, each cut after its last whole line.
/// @return false when the full reader is needed
bool SectionScanner::scan(ByteSource& source) {
    std::size_t filled = 0;
    bool isStart = true;
    bool afterContinuation = false;
    bool atEnd = false;
    while (!atEnd) {
        while (filled != m_bufferSize && !atEnd) {
            const std::size_t count = source.read(m_buffer.get() + filled, m_bufferSize - filled);
            atEnd = count == 0;
            filled += count;
        }
        std::string_view lines(m_buffer.get(), filled);
        if (!atEnd) {
            // A line that is longer than the buffer leaves none: npos + 1 is 0.
            lines = lines.substr(0, lines.rfind('\n') + 1);
            if (lines.empty()) {
                return false;
            }
        }
        const std::size_t done = lines.size();
        if (isStart && lines.substr(0, BYTE_ORDER_MARK.size()) == BYTE_ORDER_MARK) {
            lines.remove_prefix(BYTE_ORDER_MARK.size());
        }
        if (!scanLines(lines, afterContinuation)) {
            return false;
        }
        isStart = false;
        afterContinuation = endInBackslash(lines);
        filled -= done;
        std::memmove(m_buffer.get(), m_buffer.get() + done, filled);
    }
    return true;
}

/// @param afterContinuation whether the line before these ends in a `\`
bool SectionScanner::scanLines(std::string_view lines, bool afterContinuation) {
    std::size_t next = 0;
    while ((next = lines.find('[', next)) != lines.npos) {
        const std::size_t bracket = next++;
        std::size_t start = bracket;
        while (start != 0 && isBlank(lines[start - 1])) {
            --start;
        }
        if (start != 0 && lines[start - 1] != '\n') {
            continue; // not the first in its line
        }
        if (start == 0 ? afterContinuation : endInBackslash(lines.substr(0, start))) {
            return false;
        }
        // npos + 1 is 0: the last line may have no end.
        const std::size_t behind = lines.find('\n', bracket) + 1;
        next = behind == 0 ? lines.size() : behind;
        const std::string_view line = withoutLineEnd(lines.substr(bracket, next - bracket));
        if (line.back() == '\\') {
            return false;
        }
        const Header header = parseHeader(withoutTrailingBlanks(line));
        if (!header.name.empty()) {
            m_names.add(header.name);
        }
    }
    return true;
}

void SectionScanner::parse(ByteSource& source) {
    const Text text = readAll(source);
    LineReader reader(text.bytes.get(), text.size);
    Line line;
    while (reader.next(line)) {
        if (line.kind == Line::Kind::HEADER) {
            m_names.add(line.name);
        }
    }
}

} // namespace acd
