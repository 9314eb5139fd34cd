#pragma once

#include "lint/FamilyResult.h"

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

/// Checks models one after the other. What was found in a family is kept for the next model that shares it.
class Checker {
public:
    /// Is called with the number of families and rule sets that are done, and of all.
    using Progress = std::function<void(std::size_t, std::size_t)>;

    /// All findings that no comment suppresses, in the order of files and locations. They refer to the model.
    [[nodiscard]] std::vector<Finding> check(const Model& model, const Selection& selection,
                                             const Progress& progress = {});

private:
    void checkFamilies(const Model& model, const std::function<void()>& advance);

    FamilyContext m_context;
    FamilyResults m_results;
};

/// Checks one model.
[[nodiscard]] std::vector<Finding> check(const Model& model, const Selection& selection,
                                         const Checker::Progress& progress = {});

} // namespace lint
