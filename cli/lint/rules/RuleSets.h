#pragma once

#include "lint/Rule.h"

namespace lint {

[[nodiscard]] RuleSet agreementRules();
[[nodiscard]] RuleSet commentRules(); ///< checked last, by `Suppressions`
[[nodiscard]] RuleSet confusableRules();
[[nodiscard]] RuleSet consistencyRules();
[[nodiscard]] RuleSet flashRules();
[[nodiscard]] RuleSet idcodeRules();
[[nodiscard]] RuleSet keyRules();
[[nodiscard]] RuleSet layerRules();
[[nodiscard]] RuleSet lineRules();
[[nodiscard]] RuleSet listRules();
[[nodiscard]] RuleSet modeRules();
[[nodiscard]] RuleSet nameRules();
[[nodiscard]] RuleSet propertyRules();
[[nodiscard]] RuleSet supportRules();
[[nodiscard]] RuleSet tableRules();

} // namespace lint
