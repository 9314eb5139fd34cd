#pragma once

#include "lint/Findings.h"
#include "term/Terminal.h"
#include "text/Json.h"

#include <cstddef>
#include <string>
#include <vector>

namespace lint {

/// The result of a run of the linter.
struct Report {
    std::vector<Finding> findings;

    [[nodiscard]] std::size_t count(Severity severity) const;
};

/// "2 errors, 1 warning".
[[nodiscard]] std::string summary(const Report& report);

/// "T101: 2, T112: 1", the most frequent code first.
[[nodiscard]] std::string countsByCode(const Report& report);

/// For each finding a workflow command that GitHub shows at the line.
[[nodiscard]] std::string asGithub(const Report& report);

/// For each finding `file:line:column: error: text [CODE]`, the line of the file, and a caret below.
[[nodiscard]] std::string asText(const Report& report, const Terminal& terminal);

/// An object of all findings.
[[nodiscard]] Json asJson(const Report& report);

/// A log in SARIF 2.1.0.
[[nodiscard]] Json asSarif(const Report& report);

} // namespace lint
