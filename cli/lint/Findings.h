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

    // What connects a finding with its consequences: facts, such as "kestrel under SS", or names.
    std::string reports{}; ///< the fact that it reports, or the name that it takes for the right one
    std::string restsOn{}; ///< the fact whose report makes it a consequence

    /// The mode of base.acd that does not list the file's family: to list it is a fix, which depends on another file.
    std::string unlistedIn{};
};

/// The names of the facts that findings report and rest on.
namespace fact {

/// A name belongs to a mode, or does not.
[[nodiscard]] inline std::string inMode(std::string_view name, std::string_view mode) {
    return fmt::format("{} under {}", name, mode);
}

/// A name belongs to a list, or does not.
[[nodiscard]] inline std::string inList(std::string_view name, std::string_view key) {
    return fmt::format("{} in {}", name, key);
}

/// A name of a property is wrong.
[[nodiscard]] inline std::string name(std::string_view property) {
    return fmt::format("the name {}", property);
}

/// A key exists, or does not.
[[nodiscard]] inline std::string key(std::string_view name) { return fmt::format("key {}", name); }

} // namespace fact

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
    /// @return the finding, until the next one is added
    template <typename... Arguments>
    Finding& addUnknown(const Rule& rule, const Token& token, const Token& name, const Suggestion& suggestion,
                        fmt::format_string<Arguments...> format, Arguments&&... arguments) {
        Finding& finding = addText(
            rule, token, fmt::format(format, std::forward<Arguments>(arguments)...) + suggestion.question());
        finding.fix = replacing(name, suggestion);
        finding.restsOn = name.text;
        return finding;
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

/// The findings without those that are consequences of others: of findings that rest on the same fact the first one
/// that reports it is left.
[[nodiscard]] std::vector<Finding> withoutConsequences(const std::vector<Finding>& findings);

/// The same findings in the order of files and locations.
[[nodiscard]] std::vector<Finding> sorted(std::vector<Finding> findings, const Model& model);

/// The text between quotation marks, shortened when it is long.
[[nodiscard]] std::string inQuotes(std::string_view text);

/// For each finding, in their order, a text that identifies it across versions of a database: it does not depend
/// on line numbers. 16 hexadecimal digits.
[[nodiscard]] std::vector<std::string> fingerprints(const std::vector<Finding>& findings);

} // namespace lint
