// Runs all rules over a database.
#include "lint/Check.h"

#include "lint/Suppressions.h"

namespace lint {

std::vector<Finding> check(const Model& model, const Selection& selection,
                           const std::function<void(std::size_t, std::size_t)>& progress) {
    Findings findings;
    std::size_t done = 0;
    for (const RuleSet& set : ruleSets()) {
        if (set.check != nullptr) {
            set.check(model, findings);
        }
        if (progress) {
            progress(++done, ruleSets().size());
        }
    }
    // Comments first: one that suppresses a finding is used, even if that finding is not selected.
    std::vector<Finding> all = withoutSuppressed(model, findings);
    std::erase_if(all, [&](const Finding& finding) {
        return (!selection.selected.empty() && !selection.selected.contains(finding.rule)) ||
               selection.ignored.contains(finding.rule) ||
               (selection.isMeant && !selection.isMeant(finding)) ||
               (finding.rule->needsAllFiles && !model.isComplete());
    });
    if (!selection.withConsequences) {
        all = withoutConsequences(all);
    }
    return sorted(std::move(all), model);
}

} // namespace lint
