#pragma once

#include "diff/Comparison.h"
#include "term/Terminal.h"
#include "text/Json.h"

#include <string>

namespace diff {

[[nodiscard]] std::string asText(const Comparison& comparison, const Terminal& terminal);
[[nodiscard]] Json asJson(const Comparison& comparison);

/// For release notes: sections under headings of the third level, nothing when there is no difference.
[[nodiscard]] std::string asMarkdown(const Comparison& comparison);

} // namespace diff
