// The one table of rules: the source of the document, of --explain and of the reports.
#include "lint/Rule.h"

#include "lint/Findings.h"
#include "lint/rules/RuleSets.h"
#include "term/Table.h"
#include "text/Suggest.h"

#include <fmt/ranges.h>

#include <algorithm>

namespace lint {

std::string Rule::explanation() const {
    return fmt::format("{}", fmt::join(wordsOf(std::string(detail)), " "));
}

const std::vector<RuleSet>& ruleSets() {
    static const std::vector<RuleSet> all{
        supportRules(), consistencyRules(), confusableRules(), idcodeRules(),    listRules(),
        keyRules(),     lineRules(),        modeRules(),       nameRules(),      propertyRules(),
        layerRules(),   flashRules(),       tableRules(),      agreementRules(), commentRules()};
    return all;
}

const std::vector<const Rule*>& rules() {
    static const std::vector<const Rule*> all = [] {
        std::vector<const Rule*> joined;
        for (const RuleSet& set : ruleSets()) {
            joined.insert(joined.end(), set.rules.begin(), set.rules.end());
        }
        std::sort(joined.begin(), joined.end(),
                  [](const Rule* left, const Rule* right) { return left->code < right->code; });
        return joined;
    }();
    return all;
}

std::string_view subjectOf(const Rule& rule) {
    const auto found = std::find_if(ruleSets().begin(), ruleSets().end(), [&rule](const RuleSet& set) {
        return !set.subject.empty() && set.rules.front()->code.front() == rule.code.front();
    });
    return found->subject; // each letter has a set with a subject
}

std::vector<const Rule*> rulesOf(std::string_view codeOrSlug) {
    std::vector<const Rule*> found;
    std::copy_if(rules().begin(), rules().end(), std::back_inserter(found), [&](const Rule* rule) {
        return !codeOrSlug.empty() && (sameWithoutCase(rule->code.substr(0, codeOrSlug.size()), codeOrSlug) ||
                                       sameWithoutCase(rule->slug, codeOrSlug));
    });
    return found;
}

} // namespace lint
