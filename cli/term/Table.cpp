// The one place where text is laid out in columns and lines.
#include "term/Table.h"

#include <algorithm>
#include <iterator>
#include <sstream>

namespace {

constexpr std::size_t GAP = 2;

/// Narrower than this, broken words are harder to read than lines that are too long.
constexpr std::size_t LEAST_WIDTH = 10;

/// The number of characters, taking the text as UTF-8: bytes that continue a character are no column, nor are the
/// marks for colours.
std::size_t width(std::string_view text) {
    std::size_t columns = 0;
    bool isMark = false;
    for (const char byte : text) {
        isMark = isMark || byte == '\033';
        columns += !isMark && (static_cast<unsigned char>(byte) & 0xC0U) != 0x80U ? 1 : 0;
        isMark = isMark && byte != 'm';
    }
    return columns;
}

void dropTrailingBlanks(std::string& text) { text.resize(text.find_last_not_of(' ') + 1); }

std::vector<std::size_t> widthsOf(const std::vector<Table::Row>& rows) {
    std::vector<std::size_t> widths;
    for (const Table::Row& row : rows) {
        widths.resize(std::max(widths.size(), row.size()));
        for (std::size_t column = 0; column < row.size(); ++column) {
            widths[column] = std::max(widths[column], width(row[column]));
        }
    }
    return widths;
}

/// The row, or several where the words of its last column don't fit.
std::vector<Table::Row> broken(const Table::Row& row, std::size_t columns, std::size_t room) {
    if (row.size() < columns || width(row.back()) <= room) {
        return {row};
    }
    std::vector<Table::Row> rows;
    for (std::string& line : lines(wordsOf(row.back()), room, "")) {
        rows.push_back(rows.empty() ? row : Table::Row(columns));
        rows.back().back() = std::move(line);
    }
    return rows;
}

} // namespace

std::string Table::text(const Terminal& terminal, std::size_t indent) const {
    std::vector<Row> rows = m_rows;
    for (Row& row : rows) {
        for (std::string& cell : row) {
            cell = terminal.sanitised(cell);
        }
    }
    const std::vector<std::size_t> widths = widthsOf(rows);
    std::size_t taken = indent;
    for (std::size_t column = 0; column + 1 < widths.size(); ++column) {
        taken += widths[column] + GAP;
    }
    const std::size_t room = terminal.isTerminal()
                                 ? std::max(terminal.width() - std::min(terminal.width(), taken), LEAST_WIDTH)
                                 : std::string::npos;
    std::string text;
    for (const Row& whole : rows) {
        const bool isHeading = m_hasHeadings && &whole == &rows.front();
        for (const Row& row : broken(whole, widths.size(), room)) {
            std::string line(indent, ' ');
            for (std::size_t column = 0; column < row.size(); ++column) {
                line += row[column];
                line.append(widths[column] - std::min(widths[column], width(row[column])) + GAP, ' ');
            }
            dropTrailingBlanks(line);
            text += (isHeading ? terminal.heading(line) : line) + '\n';
        }
    }
    return text;
}

std::vector<std::string> lines(const std::vector<std::string>& words, std::size_t width,
                               std::string_view separator) {
    std::vector<std::string> broken;
    std::size_t taken = 0;
    for (std::size_t i = 0; i < words.size(); ++i) {
        const std::string word = words[i] + std::string(i + 1 < words.size() ? separator : "");
        const std::size_t needed = ::width(word);
        if (!broken.empty() && taken + 1 + needed <= width) {
            broken.back() += ' ' + word;
            taken += 1 + needed;
        } else {
            broken.push_back(word);
            taken = needed;
        }
    }
    return broken;
}

std::string wrapped(const std::vector<std::string>& words, std::size_t indent, std::size_t width) {
    std::string text;
    for (const std::string& line : lines(words, width - std::min(width, indent))) {
        text.append(indent, ' ').append(line).append(1, '\n');
    }
    return text;
}

std::vector<std::string> wordsOf(const std::string& text) {
    std::istringstream stream(text);
    return {std::istream_iterator<std::string>(stream), {}};
}
