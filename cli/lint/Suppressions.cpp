// Comments to the linter: each is above a line, and applies to that line with its continuation lines.
#include "lint/Suppressions.h"

#include "lint/rules/RuleSets.h"

#include <algorithm>
#include <iterator>
#include <map>
#include <set>

namespace lint {

namespace {

constexpr Rule UNREADABLE_COMMENT{
    "X101",
    "unreadable-comment",
    Severity::WARNING,
    "comment to the linter that cannot be read",
    R"(A comment to the linter has the form "# lint: ignore CODE", with blanks or commas between several codes. Any
other form, or an unknown code, has no effect.)",
    "# lint: ignore T999"};
constexpr Rule UNUSED_SUPPRESSION{
    "X102",
    "unused-suppression",
    Severity::WARNING,
    "comment that ignores nothing",
    R"(The line below, its continuation lines included, has no finding of that code: the line was corrected, or the
comment was separated from it. Remove the comment before it hides a new finding.)",
    "# lint: ignore T105\nOPERATION = PROGRAM,Bscan,USB2"};

constexpr std::string_view BLANKS = " \t,";

/// One code of a comment.
struct Suppression {
    Token code;
    bool isUsed = false;
};

bool isCode(std::string_view text) {
    return std::any_of(rules().begin(), rules().end(),
                       [text](const Rule* rule) { return rule->code == text; });
}

/// Reads the comments of one file.
class Comments {
public:
    Comments(const AcdLines& file, Findings& findings) : m_file(file) {
        for (const AcdLines::Comment& comment : file.comments()) {
            read(comment, findings);
        }
    }

    /// Is a finding of this code in this line to be ignored?
    bool ignores(std::string_view code, unsigned line) {
        bool isIgnored = false;
        for (unsigned above = firstLineOf(line); above > 1 && m_isComment.contains(--above);) {
            for (Suppression& suppression : m_suppressions[above]) {
                if (suppression.code.text == code) {
                    suppression.isUsed = isIgnored = true;
                }
            }
        }
        return isIgnored;
    }

    void addUnused(Findings& findings) const {
        for (const auto& [line, suppressions] : m_suppressions) {
            for (const Suppression& suppression : suppressions) {
                if (!suppression.isUsed) {
                    findings.add(UNUSED_SUPPRESSION, suppression.code,
                                 "nothing to ignore: no {} in the line below", suppression.code.text);
                }
            }
        }
    }

private:
    void read(const AcdLines::Comment& comment, Findings& findings) {
        m_isComment.insert(comment.line);
        std::string_view rest = comment.text.substr(1);
        const auto dropBlanks = [&rest] {
            rest.remove_prefix(std::min(rest.find_first_not_of(BLANKS), rest.size()));
        };
        const auto token = [&](std::size_t length) {
            const std::size_t offset = comment.text.size() - rest.size();
            return Token{rest.substr(0, length),
                         {&m_file, comment.line, comment.column + static_cast<unsigned>(offset)}};
        };
        const auto drop = [&rest](std::string_view word) {
            const bool isThere = rest.starts_with(word);
            rest.remove_prefix(isThere ? word.size() : 0);
            return isThere;
        };
        dropBlanks();
        if (!drop("lint:")) {
            return;
        }
        dropBlanks();
        const Token what = token(rest.size());
        if (!drop("ignore") || rest.find_first_of(BLANKS) != 0) {
            findings.addText(UNREADABLE_COMMENT, what, "the form is \"# lint: ignore CODE\"");
            return;
        }
        for (dropBlanks(); !rest.empty(); dropBlanks()) {
            const Token code = token(std::min(rest.find_first_of(BLANKS), rest.size()));
            rest.remove_prefix(code.text.size());
            if (!isCode(code.text)) {
                findings.add(UNREADABLE_COMMENT, code, "there is no code {}", inQuotes(code.text));
            } else {
                m_suppressions[comment.line].push_back({code});
            }
        }
    }

    /// The first line of those that this one continues.
    [[nodiscard]] unsigned firstLineOf(unsigned line) const {
        const std::vector<AcdLines::Line>& lines = m_file.lines();
        const auto next = std::upper_bound(
            lines.begin(), lines.end(), line,
            [](unsigned wanted, const AcdLines::Line& candidate) { return wanted < candidate.firstLine; });
        return next == lines.begin() ? line : std::prev(next)->firstLine;
    }

    const AcdLines& m_file;
    std::set<unsigned> m_isComment;
    std::map<unsigned, std::vector<Suppression>> m_suppressions; ///< by line
};

} // namespace

RuleSet commentRules() {
    return {"comments to the linter", {&UNREADABLE_COMMENT, &UNUSED_SUPPRESSION}, nullptr, nullptr};
}

std::vector<Finding> withoutSuppressed(const Model& model, std::vector<Finding> findings) {
    Findings ofComments;
    std::map<const AcdLines*, Comments> comments;
    for (const AcdLines* file : model.files()) {
        comments.try_emplace(file, *file, ofComments);
    }
    std::erase_if(findings, [&comments](const Finding& finding) {
        return comments.at(finding.location.file).ignores(finding.rule->code, finding.location.line);
    });
    for (const auto& [file, ofFile] : comments) {
        ofFile.addUnused(ofComments);
    }
    findings.insert(findings.end(), ofComments.all().begin(), ofComments.all().end());
    return findings;
}

} // namespace lint
