#pragma once

#include "lint/Findings.h"

#include <vector>

namespace lint {

/// Drops the findings that a comment `# lint: ignore CODE...` directly above the line suppresses. Adds findings
/// for the comments that suppress nothing, and for those that cannot be read.
[[nodiscard]] std::vector<Finding> withoutSuppressed(const Model& model, std::vector<Finding> findings);

} // namespace lint
