#pragma once

#include "lint/Findings.h"

#include <cstddef>
#include <functional>
#include <set>
#include <vector>

namespace lint {

/// Which findings are wanted.
struct Selection {
    std::set<const Rule*> selected{}; ///< none: all
    std::set<const Rule*> ignored{};
    std::function<bool(const Finding&)> isMeant{}; ///< none: all
    bool withConsequences = false;                 ///< of other findings, too
};

/// All findings of a database that no comment suppresses, in the order of files and locations.
/// @param progress is called with the number of rule sets that are done, and of all
[[nodiscard]] std::vector<Finding> check(const Model& model, const Selection& selection,
                                         const std::function<void(std::size_t, std::size_t)>& progress = {});

} // namespace lint
