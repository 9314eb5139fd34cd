#pragma once

#include "diff/Comparison.h"

#include <optional>
#include <string>
#include <vector>

namespace edit {

/// A file and the text that it is to have.
struct Rewrite {
    std::string path;
    std::string text;
};

/// Which answers change when files of a database are rewritten. The database is not touched: it is copied.
/// @param layers its directories, the uppermost first
/// @return the differences; nothing if no layer has a base.acd, since then there is no database to ask
/// @throw CommandError (FAULT) if a database cannot be read or copied
[[nodiscard]] std::optional<diff::Comparison> effectOf(const std::vector<std::string>& layers,
                                                       const std::vector<Rewrite>& rewrites);

} // namespace edit
