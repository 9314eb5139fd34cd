#pragma once

#include "lint/Model.h"
#include "lint/Rule.h"

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace lint {

struct Finding {
    const Rule* rule;
    Place place;
    std::size_t length; ///< in bytes, on the line of the place; 0 for a place between two bytes
    std::string text;
};

/// What was found so far. Adding never fails, so that no finding hides the next.
class Findings {
public:
    void add(const Rule& rule, const Token& token, std::string text);

    /// `; did you mean "..."?`, or nothing.
    [[nodiscard]] std::string didYouMean(std::string_view text, const std::vector<std::string>& candidates);

    [[nodiscard]] const std::vector<Finding>& all() const noexcept { return m_findings; }

private:
    std::vector<Finding> m_findings;

    /// Comparisons left for suggestions: a file of nothing but unknown names must not take forever.
    std::size_t m_comparisons = 2'000'000;
};

/// The same findings in the order of files and places.
[[nodiscard]] std::vector<Finding> sorted(std::vector<Finding> findings, const Model& model);

/// The text between quotation marks, shortened when it is long.
[[nodiscard]] std::string quoted(std::string_view text);

/// A text for each finding, in their order, that names it from one version of a database to the next: it does
/// not depend on line numbers. 16 hexadecimal digits.
[[nodiscard]] std::vector<std::string> fingerprints(const std::vector<Finding>& findings);

} // namespace lint
