#pragma once

#include "lsp/Protocol.h"
#include "lsp/Workspace.h"

#include <functional>
#include <string>

namespace lsp {

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

    /// The location of a text: URI and range.
    [[nodiscard]] Json locationOf(const lint::Token& token) const;
};

} // namespace lsp
