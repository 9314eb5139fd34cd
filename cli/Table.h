#pragma once

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
    explicit Table(Row headings) { add(std::move(headings)); }

    void add(Row row) { m_rows.push_back(std::move(row)); }

    /// All rows, each behind `indent` blanks.
    [[nodiscard]] std::string text(std::size_t indent = 0) const;

private:
    std::vector<Row> m_rows;
};

/// What a line of text should not exceed.
inline constexpr std::size_t LINE_WIDTH = 80;

/// The words, with `separator` and a blank between, broken into lines of at most `width` bytes where the words
/// allow it.
[[nodiscard]] std::vector<std::string> lines(const std::vector<std::string>& words, std::size_t width,
                                             std::string_view separator = ",");

/// The same, with commas, as a text that fits 80 columns, each line behind `indent` blanks.
[[nodiscard]] std::string wrapped(const std::vector<std::string>& words, std::size_t indent);
