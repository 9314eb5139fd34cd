// Collects findings, sorts them, and identifies them independently of edits elsewhere in the file.
#include "lint/Findings.h"

#include "database/FileNames.h"
#include "text/Suggest.h"
#include "text/Trimmed.h"

#include <algorithm>
#include <cstdint>
#include <iterator>
#include <map>
#include <set>
#include <tuple>
#include <utility>

namespace lint {

namespace {

/// The source of a finding's fingerprint, without its ordinal: of a long line the part around the finding.
std::string subject(const Finding& finding) {
    constexpr std::size_t MAX_LENGTH = 400;
    std::string text(finding.rule->code);
    text.append("\n").append(acd::fileNameOf(finding.location.file->path())).append("\n");
    std::string_view source = finding.location.file->source(finding.location.line);
    if (source.size() > MAX_LENGTH) {
        const std::size_t at = std::min<std::size_t>(finding.location.column - 1, source.size());
        source = source.substr(at - std::min(at, MAX_LENGTH / 2), MAX_LENGTH);
    }
    return text.append(trimmed(source, " \t\r"));
}

/// FNV-1a: the same on every machine and in every version.
std::uint64_t hash(std::string_view text) {
    std::uint64_t value = 0xcbf29ce484222325U;
    for (const char byte : text) {
        value = (value ^ static_cast<unsigned char>(byte)) * 0x100000001b3U;
    }
    return value;
}

/// Finds out which findings are caused by others.
class Causes {
public:
    explicit Causes(const std::vector<Finding>& findings) {
        for (const Finding& finding : findings) {
            if (!finding.reports.empty()) {
                m_first.emplace(finding.reports, &finding);
            }
            if (finding.rule->spoilsLine) {
                m_spoilt.emplace(finding.location.file, finding.location.line);
            }
        }
    }

    [[nodiscard]] bool haveCaused(const Finding& finding) const {
        if (!finding.rule->spoilsLine && m_spoilt.contains({finding.location.file, finding.location.line})) {
            return true;
        }
        // No circle: a finding rests on what is wrong, and reports the same or what is right.
        const auto cause = m_first.find(finding.restsOn);
        return cause != m_first.end() && cause->second != &finding;
    }

private:
    std::map<std::string_view, const Finding*> m_first; ///< by what they report
    std::set<std::pair<const AcdLines*, unsigned>> m_spoilt;
};

} // namespace

Finding& Findings::addText(const Rule& rule, const Token& token, std::string text) {
    // A text that continues in the next line is marked up to the end of its first line.
    const SourceLocation& location = token.location;
    const std::size_t lineLength = location.file->source(location.line).size();
    const std::size_t rest = lineLength - std::min<std::size_t>(lineLength, location.column - 1);
    return m_findings.emplace_back(
        Finding{&rule, location, std::min(token.text.size(), rest), std::move(text)});
}

Suggestion Findings::suggest(std::string_view text, const std::vector<std::string>& candidates,
                             const std::vector<Token>& used) {
    if (used.size() > m_comparisonsLeft) {
        return {};
    }
    m_comparisonsLeft -= used.size();
    std::set<std::string_view> names;
    for (const Token& token : used) {
        names.insert(token.text);
    }
    return suggest(text, candidates,
                   [&names](const std::string& candidate) { return names.contains(candidate); });
}

Suggestion Findings::suggest(std::string_view text, const std::vector<std::string>& candidates,
                             const std::function<bool(const std::string&)>& isUsed) {
    if (candidates.size() > m_comparisonsLeft) {
        return {};
    }
    m_comparisonsLeft -= candidates.size();
    std::vector<std::string> unused;
    std::copy_if(candidates.begin(), candidates.end(), std::back_inserter(unused), std::not_fn(isUsed));
    std::optional<std::string> name = ::suggest(text, unused);
    const bool isOtherCase = name && sameWithoutCase(*name, text);
    return {std::move(name), isOtherCase};
}

std::vector<Finding> withoutConsequences(const std::vector<Finding>& findings) {
    const Causes causes(findings);
    std::vector<Finding> kept;
    std::copy_if(findings.begin(), findings.end(), std::back_inserter(kept),
                 [&causes](const Finding& finding) { return !causes.haveCaused(finding); });
    return kept;
}

std::vector<Finding> sorted(std::vector<Finding> findings, const Model& model) {
    std::map<const AcdLines*, std::size_t> order;
    for (const AcdLines* file : model.files()) {
        order.emplace(file, order.size());
    }
    const auto location = [&order](const Finding& finding) {
        return std::tuple(order.at(finding.location.file), finding.location.line, finding.location.column,
                          finding.rule->code);
    };
    std::stable_sort(
        findings.begin(), findings.end(),
        [&location](const Finding& left, const Finding& right) { return location(left) < location(right); });
    return findings;
}

std::string inQuotes(std::string_view text) {
    constexpr std::size_t MAX_LENGTH = 60;
    return text.size() <= MAX_LENGTH ? fmt::format("\"{}\"", text)
                                     : fmt::format("\"{}...\"", text.substr(0, MAX_LENGTH));
}

std::vector<std::string> fingerprints(const std::vector<Finding>& findings) {
    std::map<std::string, std::size_t> seen;
    std::vector<std::string> all;
    for (const Finding& finding : findings) {
        const std::string text = subject(finding);
        all.push_back(fmt::format("{:016x}", hash(fmt::format("{}\n{}", text, seen[text]++))));
    }
    return all;
}

} // namespace lint
