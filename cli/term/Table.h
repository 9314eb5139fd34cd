#pragma once

#include "term/Terminal.h"

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

/// A table of text with aligned columns, two blanks between them and none at the ends of lines.
class Table {
public:
    using Row = std::vector<std::string>;

    Table() = default;

    /// With a first row of headings.
    explicit Table(Row headings) : m_hasHeadings(true) { add(std::move(headings)); }

    void add(Row row) { m_rows.push_back(std::move(row)); }

    /// All rows, indented. On a terminal the words of the last column continue in further lines if they don't fit;
    /// otherwise a row is a line, for programs that read lines.
    [[nodiscard]] std::string text(const Terminal& terminal, std::size_t indent = 0) const;

private:
    std::vector<Row> m_rows;
    bool m_hasHeadings = false;
};

/// The words, joined by `separator` and a blank, in lines of at most `width` columns. A longer word has its own line.
[[nodiscard]] std::vector<std::string> lines(const std::vector<std::string>& words, std::size_t width,
                                             std::string_view separator = ",");

/// The same with commas, as a text of that width with indented lines.
[[nodiscard]] std::string wrapped(const std::vector<std::string>& words, std::size_t indent,
                                  std::size_t width = LINE_WIDTH);

/// The words of a text.
[[nodiscard]] std::vector<std::string> wordsOf(const std::string& text);
