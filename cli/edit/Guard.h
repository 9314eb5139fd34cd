#pragma once

#include "diff/Snapshot.h"
#include "edit/Draft.h"
#include "lint/Model.h"

#include <set>
#include <string>
#include <vector>

namespace edit {

/// What an edit is meant to change, and nothing else.
struct Intention {
    diff::Renaming renamed{};
    std::set<std::string> removed{}; ///< names of devices, families and flashes
    std::set<std::string> added{};
    std::set<std::string> modes{}; ///< that nothing was configured in before
};

/// Checks that a draft does what it is meant to do: that lint has no finding which it did not have before, and that no
/// other answer differs.
/// @param before the database as it is
/// @param layers its directories, the uppermost first
/// @throw CommandError (FAULT) that says which finding, or which answer
void requireMeant(const lint::Model& before, const Draft& draft, const std::vector<std::string>& layers,
                  const Intention& intention);

/// The differences that are not meant.
[[nodiscard]] diff::Comparison unmeant(diff::Comparison comparison, const Intention& intention);

/// The findings of a draft that the database does not have, one a line with its place.
[[nodiscard]] std::string newFindings(const lint::Model& before, const Draft& draft,
                                      const Intention& intention);

} // namespace edit
