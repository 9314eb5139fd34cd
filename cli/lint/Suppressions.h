#pragma once

#include "lint/Findings.h"

#include <vector>

namespace lint {

/// Drops what a comment `# lint: ignore CODE...` right above the line tells to ignore. Adds the comments that
/// ignore nothing, and those that can't be read.
[[nodiscard]] std::vector<Finding> withoutIgnored(const Model& model, const Findings& findings);

} // namespace lint
