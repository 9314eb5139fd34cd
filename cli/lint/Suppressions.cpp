// Comments to the linter: they stand above a line, and speak for all that the line goes on with.
#include "lint/Suppressions.h"

#include "lint/rules/RuleSets.h"

#include <fmt/format.h>

#include <algorithm>
#include <iterator>
#include <map>
#include <set>

namespace lint {

constexpr Rule UNREADABLE_COMMENT{
    "X101", Level::WARNING, "comment to the linter that can't be read",
    "A comment to the linter has the form \"# lint: ignore CODE\", with several codes between "
    "blanks or commas. Anything else, a code that there is not included, is without "
    "effect.",
    "# lint: ignore T999"};
constexpr Rule UNUSED_IGNORE{
    "X102", Level::WARNING, "comment that ignores nothing",
    "Nothing of that code was found in the line below, with all that it goes on with: the line "
    "was mended, or the comment has lost it. Drop the comment before it hides something new.",
    "# lint: ignore T105\nOPERATION = PROGRAM,Bscan,USB2"};

namespace {

constexpr std::string_view BLANKS = " \t,";

/// One code of a comment.
struct Ignore {
    Token code;
    bool isUsed = false;
};

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
            for (Ignore& ignore : m_ignores[above]) {
                if (ignore.code.text == code) {
                    ignore.isUsed = isIgnored = true;
                }
            }
        }
        return isIgnored;
    }

    void addUnused(Findings& findings) const {
        for (const auto& [line, ignores] : m_ignores) {
            for (const Ignore& ignore : ignores) {
                if (!ignore.isUsed) {
                    findings.add(UNUSED_IGNORE, ignore.code,
                                 fmt::format("nothing to ignore: no {} in the line below", ignore.code.text));
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
            findings.add(UNREADABLE_COMMENT, what, "the form is \"# lint: ignore CODE\"");
            return;
        }
        for (dropBlanks(); !rest.empty(); dropBlanks()) {
            const Token code = token(std::min(rest.find_first_of(BLANKS), rest.size()));
            rest.remove_prefix(code.text.size());
            if (ruleOf(code.text) == nullptr) {
                findings.add(UNREADABLE_COMMENT, code, fmt::format("there is no code {}", quoted(code.text)));
            } else {
                m_ignores[comment.line].push_back({code});
            }
        }
    }

    /// The first line of what goes on in this one.
    [[nodiscard]] unsigned firstLineOf(unsigned line) const {
        const std::vector<AcdLines::Line>& lines = m_file.lines();
        const auto behind = std::upper_bound(
            lines.begin(), lines.end(), line,
            [](unsigned wanted, const AcdLines::Line& candidate) { return wanted < candidate.firstLine; });
        return behind == lines.begin() ? line : std::prev(behind)->firstLine;
    }

    const AcdLines& m_file;
    std::set<unsigned> m_isComment;
    std::map<unsigned, std::vector<Ignore>> m_ignores; ///< by line
};

} // namespace

std::vector<Finding> withoutIgnored(const Model& model, const Findings& findings) {
    Findings ofComments;
    std::map<const AcdLines*, Comments> comments;
    for (const AcdLines& file : model.files()) {
        comments.try_emplace(&file, file, ofComments);
    }
    std::vector<Finding> kept;
    for (const Finding& finding : findings.all()) {
        if (!comments.at(finding.place.file).ignores(finding.rule->code, finding.place.line)) {
            kept.push_back(finding);
        }
    }
    for (const auto& [file, ofFile] : comments) {
        ofFile.addUnused(ofComments);
    }
    kept.insert(kept.end(), ofComments.all().begin(), ofComments.all().end());
    return kept;
}

} // namespace lint
