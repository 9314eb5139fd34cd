// Runs all rules over a database: those about one family for the families that changed, those about several for all.
#include "lint/Check.h"

#include "lint/Suppressions.h"
#include "model/Vocabulary.h"

#include <utility>

namespace lint {

namespace {

/// The names after the label.
FamilyContext::Names listed(const Item& item) {
    FamilyContext::Names names;
    for (std::size_t i = 1; i < item.fields.size(); ++i) {
        names.emplace(item.fields[i].text);
    }
    return names;
}

} // namespace

FamilyContext::FamilyContext(const Model& model)
    : supported(model.supported().begin(), model.supported().end()),
      optionPackages(model.optionPackages().begin(), model.optionPackages().end()) {
    for (const std::string& mode : vocabulary::modes()) {
        ModeLists& lists = modes.emplace_back();
        const std::vector<Item>& items = model.baseKeys().items(mode);
        if (items.size() > 1) {
            lists.outputs = listed(items[0]);
            lists.families = listed(items[1]);
        }
    }
}

void Checker::checkFamilies(const Model& model, const std::function<void()>& advance) {
    FamilyContext context(model);
    FamilyResults former;
    if (context == m_context) {
        former = std::move(m_results);
    }
    m_results.clear();
    m_context = std::move(context);
    for (const auto& family : model.families()) {
        if (auto known = former.extract(family)) {
            m_results.insert(std::move(known));
        } else {
            FamilyResult& result = m_results[family];
            for (const RuleSet& set : ruleSets()) {
                if (set.checkFamily != nullptr) {
                    set.checkFamily(*family, m_context, result);
                }
            }
        }
        advance();
    }
}

std::vector<Finding> Checker::check(const Model& model, const Selection& selection,
                                    const Progress& progress) {
    std::size_t done = 0;
    const auto advance = [&] {
        if (progress) {
            progress(++done, model.families().size() + ruleSets().size());
        }
    };
    checkFamilies(model, advance);
    Findings common;
    for (const RuleSet& set : ruleSets()) {
        if (set.check != nullptr) {
            set.check(model, m_results, common);
        }
        advance();
    }
    std::vector<Finding> all = common.all();
    for (const auto& [family, result] : m_results) {
        all.insert(all.end(), result.findings.all().begin(), result.findings.all().end());
    }
    // Comments first: one that suppresses a finding is used, even if that finding is not selected.
    all = withoutSuppressed(model, std::move(all));
    std::erase_if(all, [&](const Finding& finding) {
        return (!selection.selected.empty() && !selection.selected.contains(finding.rule)) ||
               selection.ignored.contains(finding.rule) ||
               (selection.isMeant && !selection.isMeant(finding)) ||
               (finding.rule->needsAllFiles && !model.isComplete());
    });
    if (!selection.withConsequences) {
        all = withoutConsequences(all);
    }
    for (Finding& finding : all) {
        if (!finding.unlistedIn.empty()) {
            finding.fix = listing(model, finding.location.file->family(), {}, {finding.unlistedIn});
        }
    }
    return sorted(std::move(all), model);
}

std::vector<Finding> check(const Model& model, const Selection& selection,
                           const Checker::Progress& progress) {
    return Checker().check(model, selection, progress);
}

} // namespace lint
