#pragma once

#include "diff/CompareDatabases.h"

#include <optional>
#include <string>
#include <vector>

namespace edit {

/// A file and what is to become of it.
struct Rewrite {
    std::string path;
    std::optional<std::string> text; ///< nothing: it is removed
    std::string formerPath{};        ///< from which it is renamed; empty: it keeps its path, or is new
};

/// Which answers change when files of a database are rewritten. The database is not touched: it is copied.
/// @param layers its directories, the uppermost first
/// @return the differences; nothing if no layer has a base.acd, since then there is no database to ask
/// @param renamed what names become: such a change of a name is no difference
/// @throw CommandError (FAULT) if a database cannot be read or copied
[[nodiscard]] std::optional<diff::Comparison> effectOf(const std::vector<std::string>& layers,
                                                       const std::vector<Rewrite>& rewrites,
                                                       const diff::Renaming& renamed = {});

} // namespace edit
