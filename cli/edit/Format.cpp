// The canonical form of database files. Values may break only where the readers put nothing between two lines.
#include "edit/Format.h"

#include "model/RecordSplitter.h"
#include "model/Schema.h"

#include <algorithm>
#include <set>

namespace edit {

namespace {

using Kind = AcdLines::Kind;

/// The last columns of lists and of records, a `\` after them not included. Names of a list are short, so a narrower line
/// wastes little.
constexpr std::size_t LIST_WIDTH = 102;
constexpr std::size_t RECORD_WIDTH = 110;

/// Longer keys do not move the `=` of others.
constexpr std::size_t MAX_ALIGNED = 40;

/// The `=` of statements in one column.
struct Alignment {
    std::size_t keyWidth = 0;
    bool hasAppends = false;
};

bool isStatement(const Element& element) {
    return element.line != nullptr &&
           (element.line->kind == Kind::ASSIGNMENT || element.line->kind == Kind::APPEND);
}

bool isHeader(const Element& element) {
    return element.line != nullptr && element.line->kind == Kind::HEADER;
}

/// Are the records of a key short, so that several share a line?
bool isFilled(std::string_view key) {
    return key == schema::PROPERTY || key == schema::IDCODE || key.ends_with(schema::PROPERTY_SUFFIX);
}

/// For each element the alignment of its statement. Aligned with each other are the statements of a section up to a
/// comment after a blank line, which begins another subject.
std::vector<Alignment> alignments(const std::vector<Element>& elements) {
    std::vector<Alignment> all(elements.size());
    std::set<std::string_view> appended; ///< keys of the section
    std::size_t sectionEnd = 0;
    for (std::size_t first = 0; first < elements.size();) {
        if (first == sectionEnd) {
            appended.clear();
            do {
                if (isStatement(elements[sectionEnd]) && elements[sectionEnd].line->kind == Kind::APPEND) {
                    appended.insert(elements[sectionEnd].line->name);
                }
            } while (++sectionEnd < elements.size() && !isHeader(elements[sectionEnd]));
        }
        Alignment group;
        std::size_t last = first;
        do {
            const Element& element = elements[last];
            if (isStatement(element)) {
                const std::string_view key = element.line->name;
                group.keyWidth = std::max(group.keyWidth, key.size() <= MAX_ALIGNED ? key.size() : 0);
                group.hasAppends = group.hasAppends || appended.contains(key);
            }
            ++last;
        } while (last < sectionEnd && (elements[last].kind != Element::Kind::COMMENT ||
                                       elements[last - 1].kind != Element::Kind::BLANK));
        std::fill(all.begin() + static_cast<std::ptrdiff_t>(first),
                  all.begin() + static_cast<std::ptrdiff_t>(last), group);
        first = last;
    }
    return all;
}

/// The parts of a value between which a line may end.
std::vector<std::string_view> partsOf(const AcdLines::Line& line, schema::Shape shape) {
    std::vector<std::string_view> parts;
    const std::string_view value = line.value;
    std::size_t begin = 0;
    const auto end = [&](std::size_t at) {
        parts.push_back(value.substr(begin, at - begin));
        begin = at;
    };
    if (shape == schema::Shape::NONE) {
        for (const AcdLines::SourceSpan& span : line.spans) {
            if (span.offset > begin) {
                end(span.offset);
            }
        }
    } else {
        const char separator = shape == schema::Shape::LIST ? splitter::FIELDS : splitter::RECORDS;
        bool hasItem = false; // a line of separators alone is hard to read
        for (std::size_t at = 0; at + 1 < value.size(); ++at) {
            hasItem = hasItem || value[at] != separator;
            // Blanks at the start of a line would be dropped.
            if (value[at] == separator && value[at + 1] != ' ' && value[at + 1] != '\t' && hasItem) {
                end(at + 1);
                hasItem = false;
            }
        }
    }
    end(value.size());
    return parts;
}

class Formatter {
public:
    explicit Formatter(const SourceFile& file)
        : m_kind(schema::fileOf(file.lines().family())), m_lineEnd(file.lineEnd()) {}

    /// @return the statement in its canonical form; as it is written when that would be read as something else
    [[nodiscard]] std::string statement(const Element& element, const Alignment& alignment,
                                        bool isInSection) {
        const AcdLines::Line& line = *element.line;
        const schema::Shape shape =
            isInSection ? schema::shapeInSection(line.name) : schema::shapeOf(m_kind, line.name);
        std::string text(line.name);
        text.resize(std::max(text.size(), alignment.keyWidth), ' ');
        text += line.kind == Kind::APPEND ? " +=" : alignment.hasAppends ? "  =" : " =";
        if (!line.value.empty()) {
            text += ' ';
            addValue(line, shape, text);
        }
        text += m_lineEnd;
        const AcdLines read(text);
        const bool isSame = read.lines().size() == 1 && read.lines().front().kind == line.kind &&
                            read.lines().front().name == line.name &&
                            read.lines().front().value == line.value;
        return isSame ? text : std::string(element.source);
    }

    [[nodiscard]] std::string header(const AcdLines::Line& line) const {
        return std::string("[").append(line.name).append("]").append(m_lineEnd);
    }

private:
    void addValue(const AcdLines::Line& line, schema::Shape shape, std::string& text) const {
        const std::size_t width = shape == schema::Shape::LIST ? LIST_WIDTH : RECORD_WIDTH;
        const bool isFull =
            shape == schema::Shape::NONE || (shape == schema::Shape::RECORDS && !isFilled(line.name));
        const bool beginsWithSeparator =
            shape != schema::Shape::NONE &&
            (line.value.front() == splitter::FIELDS || line.value.front() == splitter::RECORDS);
        const std::size_t indentation = text.size() + (beginsWithSeparator ? 1 : 0);
        std::size_t column = text.size();
        bool isFirst = true;
        for (const std::string_view part : partsOf(line, shape)) {
            if (!isFirst && (isFull || column + part.size() > width)) {
                text.append(" \\").append(m_lineEnd).append(indentation, ' ');
                column = indentation;
            }
            text += part;
            column += part.size();
            isFirst = false;
        }
        if (line.value.back() == '\\') {
            text += ' '; // so that the line does not continue
        }
    }

    schema::File m_kind;
    std::string_view m_lineEnd;
};

} // namespace

std::vector<Segment> formatted(const SourceFile& file) {
    const std::vector<Element>& elements = file.elements();
    const std::vector<Alignment> aligned = alignments(elements);
    Formatter formatter(file);
    std::vector<Segment> segments{{file.byteOrderMark(), std::string(file.byteOrderMark())}};
    bool isInSection = false;
    bool isAfterBlank = true; // no blank line at the start
    bool isAfterStatement = false;
    std::size_t end = elements.size(); // without the blank lines at the end of the file
    while (end > 0 && elements[end - 1].kind == Element::Kind::BLANK) {
        --end;
    }
    for (std::size_t i = 0; i < elements.size(); ++i) {
        const Element& element = elements[i];
        std::string text;
        if (element.kind == Element::Kind::BLANK) {
            text = isAfterBlank || i >= end ? std::string_view() : file.lineEnd();
            isAfterBlank = true;
            isAfterStatement = false;
        } else {
            if (isHeader(element)) {
                isInSection = true;
                text = isAfterStatement ? std::string(file.lineEnd()) : std::string();
                text += formatter.header(*element.line);
            } else if (isStatement(element)) {
                text = formatter.statement(element, aligned[i], isInSection);
            } else {
                text = element.source;
            }
            isAfterBlank = false;
            isAfterStatement = isStatement(element);
        }
        segments.push_back({element.source, std::move(text)});
    }
    return segments;
}

std::string joined(const std::vector<Segment>& segments) {
    std::string text;
    for (const Segment& segment : segments) {
        text += segment.after;
    }
    return text;
}

bool readsAlike(const AcdLines& left, const AcdLines& right) {
    return std::equal(left.lines().begin(), left.lines().end(), right.lines().begin(), right.lines().end(),
                      [](const AcdLines::Line& one, const AcdLines::Line& other) {
                          return one.kind == other.kind && one.name == other.name &&
                                 one.value == other.value && one.error == other.error &&
                                 one.closesSection == other.closesSection;
                      }) &&
           std::equal(left.comments().begin(), left.comments().end(), right.comments().begin(),
                      right.comments().end(),
                      [](const AcdLines::Comment& one, const AcdLines::Comment& other) {
                          return one.text == other.text;
                      });
}

} // namespace edit
