#pragma once

#include "lint/Rule.h"

namespace lint {

// One function for each group of rules.
[[nodiscard]] Group idcodeRules();
[[nodiscard]] Group flashRules();
[[nodiscard]] Group keyRules();
[[nodiscard]] Group lineRules();
[[nodiscard]] Group listRules();
[[nodiscard]] Group modeRules();
[[nodiscard]] Group nameRules();
[[nodiscard]] Group propertyRules();
[[nodiscard]] Group supportRules();
[[nodiscard]] Group tableRules();

/// Comments to the linter itself. They are looked at apart, when everything else is found.
extern const Rule UNUSED_IGNORE;
extern const Rule UNREADABLE_COMMENT;

} // namespace lint
