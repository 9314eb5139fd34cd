#pragma once

#include "lsp/Protocol.h"
#include "lsp/Workspace.h"

#include <functional>
#include <string>

namespace lsp {

/// A place in a file: line and column are counted from 1, the column in bytes.
struct Place {
    unsigned line;
    std::size_t column;

    /// Is it in a text of the same file, or at one of its ends?
    [[nodiscard]] bool touches(const lint::SourceLocation& location, std::size_t length) const noexcept {
        return line == location.line && location.column <= column && column <= location.column + length;
    }
};

/// What a request is about: a file of a database, as the editor has it.
struct View {
    Workspace& workspace;
    const lint::FamilyData& family;
    const AcdLines& file;
    const Documents& documents;
    Encoding encoding;

    /// The URI of a file, as the editor spells it.
    [[nodiscard]] std::string uri(const std::string& path) const;

    [[nodiscard]] Range rangeOf(const lint::Token& token) const;

    /// The place of a position in the file.
    [[nodiscard]] Place placeOf(const Position& position) const;

    /// The location of a text: URI and range.
    [[nodiscard]] Json locationOf(const lint::Token& token) const;
};

} // namespace lsp
