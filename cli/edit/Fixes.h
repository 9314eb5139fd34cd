#pragma once

#include "edit/Proof.h"
#include "lint/Check.h"

#include <cstddef>
#include <string>
#include <vector>

namespace edit {

/// Which findings are to be fixed.
struct FixRequest {
    lint::Selection selection;
    bool withUnsafe = false; ///< guesses, too
    std::function<bool(const lint::Finding&)> isMeant;
};

/// What fixing came to.
struct FixResult {
    std::size_t fixed = 0;
    std::vector<Rewrite> rewrites;  ///< of the files that change
    std::vector<std::string> diffs; ///< of the same, as `diff -u` shows them
};

/// Fixes the findings of a database in memory. A fix that does not remove its finding, or that brings another, is left
/// out.
/// @param files of the database, as the readers have them
/// @throw CommandError (FAULT) if a file cannot be read
[[nodiscard]] FixResult fixFindings(const std::vector<AcdLines>& files, const FixRequest& request);

} // namespace edit
