// Takes a file apart by the readers' own lines, so that no second grammar can disagree with them.
#include "edit/SourceFile.h"

#include "database/LineReader.h"
#include "platform/Platform.h"
#include "term/ExitCode.h"

#include <fmt/format.h>

#include <algorithm>
#include <fstream>
#include <sstream>
#include <utility>

namespace edit {

namespace {

bool isBlankLine(std::string_view source) { return source.find_first_not_of(" \t\r\n") == source.npos; }

} // namespace

SourceFile::SourceFile(std::string text, std::string path, std::string family)
    : m_text(std::move(text)), m_lines(m_text, std::move(path), std::move(family)) {
    std::size_t start = byteOrderMark().size();
    while (start < m_text.size()) {
        m_starts.push_back(start);
        start = std::min(m_text.find('\n', start), m_text.size() - 1) + 1;
    }
    m_starts.push_back(m_text.size());
    const std::string_view all = m_text;
    const auto source = [&](std::size_t first,
                            std::size_t last) { // lines counted from 0, the last one excluded
        return all.substr(m_starts[first], m_starts[last] - m_starts[first]);
    };
    const std::size_t count = m_starts.size() - 1;
    auto next = m_lines.lines().begin();
    for (std::size_t line = 0; line < count;) {
        if (next != m_lines.lines().end() && next->firstLine == line + 1) {
            m_elements.push_back({Element::Kind::LINE, source(line, next->lastLine), &*next});
            line = next->lastLine;
            ++next;
        } else {
            const std::string_view bytes = source(line, line + 1);
            m_elements.push_back({isBlankLine(bytes) ? Element::Kind::BLANK : Element::Kind::COMMENT, bytes});
            ++line;
        }
    }
}

std::string_view SourceFile::byteOrderMark() const noexcept {
    return m_text.starts_with(acd::BYTE_ORDER_MARK) ? acd::BYTE_ORDER_MARK : std::string_view();
}

std::string_view SourceFile::lineEnd() const noexcept {
    const auto first = std::find_if(m_elements.begin(), m_elements.end(), [](const Element& element) {
        return element.kind != Element::Kind::BLANK;
    });
    const std::string_view source = first == m_elements.end() ? std::string_view() : first->source;
    const std::size_t end = source.find('\n');
    return end != source.npos && end > 0 && source[end - 1] == '\r' ? "\r\n" : "\n";
}

std::size_t SourceFile::offsetOf(unsigned line, unsigned column) const noexcept {
    return std::min(m_starts[std::min<std::size_t>(line, m_starts.size()) - 1] + column - 1, m_text.size());
}

std::string readFile(const std::string& path) {
    std::ifstream file(acd::toPath(path), std::ios::binary);
    std::ostringstream text;
    if (!file || !(text << file.rdbuf() || file.peek() == std::ifstream::traits_type::eof())) {
        throw CommandError(ExitCode::FAULT, fmt::format("cannot read \"{}\"", path));
    }
    return std::move(text).str();
}

} // namespace edit
