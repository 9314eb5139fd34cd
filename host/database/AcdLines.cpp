#include <AcdLines.h>

#include "database/FileLines.h"
#include "database/LineReader.h"
#include "database/Store.h"

#include <algorithm>
#include <array>
#include <iterator>
#include <memory>
#include <utility>

// The public view on the grammar: what a walk over a file finds, kept.

namespace {

constexpr std::array KINDS{AcdLines::Kind::HEADER, AcdLines::Kind::ASSIGNMENT, AcdLines::Kind::APPEND,
                           AcdLines::Kind::INVALID};

[[nodiscard]] AcdLines::ParseError publicError(acd::ParseErrorKind kind) noexcept {
    using acd::ParseErrorKind;
    using ParseError = AcdLines::ParseError;
    switch (kind) {
    case ParseErrorKind::NO_EQUALS_SIGN:
        return ParseError::NO_EQUALS_SIGN;
    case ParseErrorKind::EMPTY_KEY:
        return ParseError::EMPTY_KEY;
    case ParseErrorKind::BLANK_IN_KEY:
        return ParseError::BLANK_IN_KEY;
    case ParseErrorKind::NUL_BYTE:
        return ParseError::NUL_BYTE;
    case ParseErrorKind::CONTINUED_AT_END:
        return ParseError::CONTINUED_AT_END;
    case ParseErrorKind::UNCLOSED_HEADER:
        return ParseError::UNCLOSED_HEADER;
    case ParseErrorKind::EMPTY_NAME:
        return ParseError::EMPTY_NAME;
    case ParseErrorKind::BLANK_IN_NAME:
        return ParseError::BLANK_IN_NAME;
    case ParseErrorKind::TEXT_BEHIND_HEADER:
        return ParseError::TEXT_BEHIND_HEADER;
    case ParseErrorKind::LINE_TOO_LONG:
    case ParseErrorKind::VALUE_TOO_LONG: // never of a single line
        break;
    }
    return ParseError::LINE_TOO_LONG;
}

[[nodiscard]] AcdLines::Line publicLine(const acd::Line& line) {
    AcdLines::Line result{};
    result.kind = KINDS[static_cast<std::size_t>(line.kind)];
    if (line.kind == acd::Line::Kind::INVALID) {
        result.line = line.error.location.line;
        result.column = line.error.location.column;
        result.error = publicError(line.error.kind);
        result.closesSection = line.error.closesSection;
        result.text = acd::describe(line.error);
        return result;
    }
    result.name = line.name;
    result.line = line.location.line;
    result.column = line.location.column;
    if (line.kind != acd::Line::Kind::HEADER) {
        result.value = line.value;
        for (const acd::SourceSpan& span : line.spans) {
            result.spans.push_back({span.offset, span.location.line, span.location.column});
        }
    }
    return result;
}

} // namespace

AcdLines AcdFileLines::make(const acd::Family& family, const acd::SourceFile& file, std::string_view text,
                            std::string readError) {
    AcdLines lines(text, file.path, family.name);
    lines.m_readError = std::move(readError);
    lines.m_caseCollisions = file.caseCollisions;
    return lines;
}

std::vector<AcdLines> AcdLines::ofDatabase() {
    acd::Store& store = acd::Store::instance();
    std::vector<AcdLines> all;
    for (const auto& family : store.families()) {
        for (const acd::SourceFile& file : family->files) {
            std::string error;
            const acd::Text text = store.tryRead(file, error);
            all.push_back(AcdFileLines::make(*family, file, {text.bytes.get(), text.size}, std::move(error)));
        }
    }
    return all;
}

AcdLines::AcdLines(std::string_view text, std::string path, std::string family)
    : m_path(std::move(path)), m_family(std::move(family)), m_source(text.begin(), text.end()),
      m_joined(m_source) {
    splitSource();
    readLines();
}

void AcdLines::splitSource() {
    for (std::size_t start = 0; start < m_source.size();) {
        m_starts.push_back(start);
        const auto end =
            std::find(m_source.begin() + static_cast<std::ptrdiff_t>(start), m_source.end(), '\n');
        start = static_cast<std::size_t>(end - m_source.begin()) + 1;
    }
}

std::string_view AcdLines::source(unsigned line) const noexcept {
    if (line == 0 || line > m_starts.size()) {
        return {};
    }
    const std::size_t start = m_starts[line - 1];
    const std::size_t next = line < m_starts.size() ? m_starts[line] : m_source.size();
    std::string_view text(m_source.data() + start, next - start);
    if (text.ends_with('\n')) {
        text.remove_suffix(1);
        text.remove_suffix(text.ends_with('\r') ? 1 : 0);
    }
    if (line == 1 && text.starts_with(acd::BYTE_ORDER_MARK)) {
        text.remove_prefix(acd::BYTE_ORDER_MARK.size());
    }
    return text;
}

void AcdLines::readLines() {
    acd::LineReader reader(m_joined.data(), m_joined.size());
    acd::Line line;
    unsigned taken = 0;
    while (reader.next(line)) {
        Line& added = m_lines.emplace_back(publicLine(line));
        added.lastLine = reader.lineNumber();
        added.firstLine = addComments(taken + 1, added.lastLine);
        taken = added.lastLine;
    }
    static_cast<void>(addComments(taken + 1, static_cast<unsigned>(m_starts.size())));
}

/// Keeps the comments of what lies between two lines that mean something.
/// @return the first line that is neither blank nor a comment
unsigned AcdLines::addComments(unsigned first, unsigned last) {
    for (unsigned line = first; line <= last; ++line) {
        const std::string_view text = source(line);
        const std::size_t start = text.find_first_not_of(" \t");
        if (start == text.npos) {
            continue;
        }
        if (text[start] != '#') {
            return line;
        }
        m_comments.push_back({line, static_cast<unsigned>(start) + 1, text.substr(start)});
    }
    return last;
}
