#pragma once

#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace lint {

class Findings;
class Model;
struct FamilyContext;
struct FamilyData;
struct FamilyResult;

enum class Severity {
    WARNING, ///< without effect, or right only by accident
    ERROR,   ///< the database does not mean what it seems to mean
};

/// What can be found.
struct Rule {
    std::string_view code; ///< a letter and three digits; never given to another rule
    std::string_view slug; ///< its name in words: "unknown-operation"
    Severity severity;
    std::string_view title;     ///< in one line
    std::string_view detail;    ///< why it matters, and what to write instead; a line break is a blank
    std::string_view example;   ///< lines that are found
    bool needsAllFiles = false; ///< it finds what is nowhere: a file that cannot be read may have it
    bool spoilsLine = false;    ///< other findings on its line are its consequences

    /// The detail on one line.
    [[nodiscard]] std::string explanation() const;
};

/// Rules about one subject, and the functions that check them.
struct RuleSet {
    std::string_view
        subject; ///< what the rules of its letter are about; empty if the set has rules of several letters
    std::vector<const Rule*> rules;

    /// Finds what depends on one family and the context alone; null if nothing does.
    void (*checkFamily)(const FamilyData& family, const FamilyContext& context, FamilyResult& result);

    /// Finds what depends on several families; null if nothing does.
    void (*check)(const Model& model,
                  const std::map<std::shared_ptr<const FamilyData>, FamilyResult>& families,
                  Findings& findings);
};

/// All rule sets, in the order of the codes' letters.
[[nodiscard]] const std::vector<RuleSet>& ruleSets();

/// All rules, in the order of their codes.
[[nodiscard]] const std::vector<const Rule*>& rules();

/// What the rules with the same letter are about.
[[nodiscard]] std::string_view subjectOf(const Rule& rule);

/// The rules whose code begins with a text, in any case, or whose slug it is.
[[nodiscard]] std::vector<const Rule*> rulesOf(std::string_view codeOrSlug);

[[nodiscard]] constexpr std::string_view nameOf(Severity severity) {
    return severity == Severity::ERROR ? "error" : "warning";
}

} // namespace lint
