#pragma once

#include "lint/Model.h"

#include <string_view>
#include <vector>

namespace lsp {

/// One field of a value, and what it holds.
struct Field {
    lint::Token token;
    schema::Content content;
    std::string_view record; ///< the first field of its record
};

/// A statement of a file by itself, without what other lines and layers add: its fields, with their places.
class Statement {
public:
    /// @param kind of the file; FAMILY in the section of a device
    Statement(const AcdLines& file, const AcdLines::Line& line, schema::File kind);
    Statement(const Statement&) = delete;
    Statement& operator=(const Statement&) = delete;

    /// They live as long as the statement.
    [[nodiscard]] const std::vector<Field>& fields() const noexcept { return m_fields; }

private:
    lint::Value m_value;
    std::vector<Field> m_fields;
};

/// The lists of a mode that an appended text continues begin with the second one: outputs are never appended.
[[nodiscard]] std::size_t firstItem(schema::File kind, const AcdLines::Line& line);

/// Calls `use(line, kind)` for each statement and header of a file; `kind` is FAMILY in the section of a device.
template <typename Use>
void forEachLine(const AcdLines& file, Use use) {
    schema::File kind = schema::fileOf(file.family());
    bool isDropped = false;
    for (const AcdLines::Line& line : file.lines()) {
        if (line.kind == AcdLines::Kind::INVALID) {
            isDropped = isDropped || line.closesSection;
            continue;
        }
        if (line.kind == AcdLines::Kind::HEADER) {
            kind = schema::File::FAMILY;
            isDropped = false;
        }
        if (!isDropped) {
            use(line, kind);
        }
    }
}

[[nodiscard]] inline bool isStatement(const AcdLines::Line& line) {
    return line.kind == AcdLines::Kind::ASSIGNMENT || line.kind == AcdLines::Kind::APPEND;
}

[[nodiscard]] inline lint::Token nameOf(const AcdLines& file, const AcdLines::Line& line) {
    return {line.name, {&file, line.line, line.column}};
}

} // namespace lsp
