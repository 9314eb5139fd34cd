#pragma once

#include "lint/Fix.h"
#include "lint/Model.h"
#include "lint/Rule.h"

#include <fmt/format.h>

#include <cstddef>
#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace lint {

struct Finding {
    const Rule* rule;
    SourceLocation location;
    std::size_t length; ///< in bytes, on the line of the location; 0 for a place between two bytes
    std::string text;
    std::optional<Fix> fix{};
};

/// What was found so far. Adding never fails, so that no finding hides the next.
class Findings {
public:
    /// @param comparisons for suggestions: a file full of unknown names must not take forever
    explicit Findings(std::size_t comparisons = 2'000'000) : m_comparisonsLeft(comparisons) {}

    /// Adds a finding; its text is `format` with the arguments put in.
    template <typename... Arguments>
    Finding& add(const Rule& rule, const Token& token, fmt::format_string<Arguments...> format,
                 Arguments&&... arguments) {
        return addText(rule, token, fmt::format(format, std::forward<Arguments>(arguments)...));
    }

    /// Adds a finding about an unknown name; its text ends with the suggestion, which is its fix, too.
    /// @param name the part of the token that the suggestion replaces
    template <typename... Arguments>
    void addUnknown(const Rule& rule, const Token& token, const Token& name, const Suggestion& suggestion,
                    fmt::format_string<Arguments...> format, Arguments&&... arguments) {
        addText(rule, token,
                fmt::format(format, std::forward<Arguments>(arguments)...) + suggestion.question())
            .fix = replacing(name, suggestion);
    }

    /// @return the finding, for its fix; until the next one is added
    Finding& addText(const Rule& rule, const Token& token, std::string text);

    /// The nearest name, if one is near.
    /// @param used names that the place already has: they are never suggested
    [[nodiscard]] Suggestion suggest(std::string_view text, const std::vector<std::string>& candidates,
                                     const std::vector<Token>& used = {});

    /// Likewise.
    /// @param isUsed says of a candidate whether the place already has it
    [[nodiscard]] Suggestion suggest(std::string_view text, const std::vector<std::string>& candidates,
                                     const std::function<bool(const std::string&)>& isUsed);

    [[nodiscard]] const std::vector<Finding>& all() const noexcept { return m_findings; }

private:
    std::vector<Finding> m_findings;
    std::size_t m_comparisonsLeft;
};

/// The same findings in the order of files and locations.
[[nodiscard]] std::vector<Finding> sorted(std::vector<Finding> findings, const Model& model);

/// The text between quotation marks, shortened when it is long.
[[nodiscard]] std::string inQuotes(std::string_view text);

/// For each finding, in their order, a text that identifies it across versions of a database: it does not depend
/// on line numbers. 16 hexadecimal digits.
[[nodiscard]] std::vector<std::string> fingerprints(const std::vector<Finding>& findings);

} // namespace lint
