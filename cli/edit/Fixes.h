#pragma once

#include "edit/Proof.h"
#include "lint/Check.h"

#include <cstddef>
#include <functional>
#include <optional>
#include <set>
#include <string>
#include <vector>

namespace edit {

/// Which findings are to be fixed.
struct FixRequest {
    lint::Selection selection;
    bool withUnsafe =
        false; ///< guesses, too, and fixes that change answers about other names than their finding
    std::function<bool(const lint::Finding&)> isMeant;
    std::vector<std::string> layers; ///< the directories of the database, the uppermost first
};

/// What fixing came to.
struct FixResult {
    std::size_t fixed = 0;
    std::vector<Rewrite> rewrites;          ///< of the files that change
    std::vector<std::string> diffs;         ///< of the same, as `diff -u` shows them
    std::set<std::string> refused;          ///< findings whose fixes were left out, each with the reason
    std::optional<diff::Comparison> effect; ///< on the answers; nothing if there is no database to ask
};

/// Fixes the findings of a database in memory. A fix that does not remove its finding, or that brings another, is left
/// out; and so is one that changes answers about names which its finding does not concern, unless unsafe fixes are
/// wanted.
/// @param files of the database, as the readers have them
/// @throw CommandError (FAULT) if a file cannot be read
[[nodiscard]] FixResult fixFindings(const std::vector<AcdLines>& files, const FixRequest& request);

} // namespace edit
