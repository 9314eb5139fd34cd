// The one place where text is laid out in columns and lines.
#include "Table.h"

#include <algorithm>

namespace {

constexpr std::size_t GAP = 2;

/// The number of characters, taking the text as UTF-8: bytes that continue a character are no column.
std::size_t width(std::string_view text) {
    return static_cast<std::size_t>(std::count_if(text.begin(), text.end(), [](char byte) {
        return (static_cast<unsigned char>(byte) & 0xC0U) != 0x80U;
    }));
}

void dropTrailingBlanks(std::string& text) { text.resize(text.find_last_not_of(' ') + 1); }

} // namespace

std::string Table::text(std::size_t indent) const {
    std::vector<std::size_t> widths;
    for (const Row& row : m_rows) {
        widths.resize(std::max(widths.size(), row.size()));
        for (std::size_t column = 0; column < row.size(); ++column) {
            widths[column] = std::max(widths[column], width(row[column]));
        }
    }
    std::string text;
    for (const Row& row : m_rows) {
        std::string line(indent, ' ');
        for (std::size_t column = 0; column < row.size(); ++column) {
            line += row[column];
            line.append(widths[column] - width(row[column]) + GAP, ' ');
        }
        dropTrailingBlanks(line);
        text += line + '\n';
    }
    return text;
}

std::vector<std::string> lines(const std::vector<std::string>& words, std::size_t width,
                               std::string_view separator) {
    std::vector<std::string> broken;
    for (std::size_t i = 0; i < words.size(); ++i) {
        const std::string word = words[i] + std::string(i + 1 < words.size() ? separator : "");
        if (!broken.empty() && broken.back().size() + 1 + word.size() <= width) {
            broken.back() += ' ' + word;
        } else {
            broken.push_back(word);
        }
    }
    return broken;
}

std::string wrapped(const std::vector<std::string>& words, std::size_t indent) {
    std::string text;
    for (const std::string& line : lines(words, LINE_WIDTH - indent)) {
        text.append(indent, ' ').append(line).append(1, '\n');
    }
    return text;
}
