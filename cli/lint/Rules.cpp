// The one table of rules: what the documents, the explanations and the reports are made from.
#include "lint/Rule.h"

#include "lint/Findings.h"
#include "lint/rules/RuleSets.h"

#include <algorithm>

namespace lint {

const std::vector<Group>& groups() {
    static const std::vector<Group> all{lineRules(),
                                        keyRules(),
                                        listRules(),
                                        nameRules(),
                                        supportRules(),
                                        modeRules(),
                                        idcodeRules(),
                                        tableRules(),
                                        propertyRules(),
                                        flashRules(),
                                        {{&UNREADABLE_COMMENT, &UNUSED_IGNORE}, nullptr}};
    return all;
}

const std::vector<const Rule*>& rules() {
    static const std::vector<const Rule*> all = [] {
        std::vector<const Rule*> joined;
        for (const Group& group : groups()) {
            joined.insert(joined.end(), group.rules.begin(), group.rules.end());
        }
        std::sort(joined.begin(), joined.end(),
                  [](const Rule* left, const Rule* right) { return left->code < right->code; });
        return joined;
    }();
    return all;
}

const Rule* ruleOf(std::string_view code) {
    const auto found =
        std::find_if(rules().begin(), rules().end(), [code](const Rule* rule) { return rule->code == code; });
    return found == rules().end() ? nullptr : *found;
}

} // namespace lint
