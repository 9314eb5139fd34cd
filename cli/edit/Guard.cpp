// Refuses edits that would do more than they are meant to, before anything is written.
#include "edit/Guard.h"

#include "diff/Presentation.h"
#include "lint/Check.h"
#include "term/ExitCode.h"

#include <fmt/format.h>

#include <algorithm>
#include <iterator>
#include <map>
#include <tuple>

namespace edit {

namespace {

/// What identifies a finding while names and places change: in a renaming the number of its line among those that the
/// readers see, otherwise its text.
using Identity = std::tuple<const lint::Rule*, std::string, std::string>;

/// What was found, without what an edit elsewhere changes: suggestions, which depend on all names, and numbers of lines.
std::string essenceOf(const std::string& text) {
    std::string essence;
    const auto isDigit = [](char byte) { return byte >= '0' && byte <= '9'; };
    for (const char byte : text.substr(0, text.find("; did you mean"))) {
        const bool isOfLine = isDigit(byte) && (essence.ends_with("line ") || essence.ends_with(':'));
        if (!isOfLine) {
            essence += byte;
        }
    }
    return essence;
}

std::string lineNumber(const lint::SourceLocation& location) {
    const std::vector<AcdLines::Line>& lines = location.file->lines();
    return std::to_string(std::count_if(lines.begin(), lines.end(), [&location](const AcdLines::Line& line) {
        return line.firstLine <= location.line;
    }));
}

Identity identityOf(const lint::Finding& finding, bool isRenaming, const std::string& path) {
    return {finding.rule, path, isRenaming ? lineNumber(finding.location) : essenceOf(finding.text)};
}

bool isSubset(const diff::StringSet& texts, const std::set<std::string>& of) {
    return std::includes(of.begin(), of.end(), texts.begin(), texts.end());
}

void dropNames(diff::Devices& devices, const std::set<std::string>& names) {
    for (auto& [family, list] : devices) {
        std::erase_if(list, [&names](const std::string& device) { return names.contains(device); });
    }
    std::erase_if(devices, [](const auto& family) { return family.second.empty(); });
}

} // namespace

std::string newFindings(const lint::Model& before, const Draft& draft, const Intention& intention) {
    const bool isRenaming = !intention.renamed.empty();
    std::map<std::string, std::string> formerPaths;
    for (const Draft::File& file : draft.files()) {
        formerPaths.emplace(file.path, file.formerPath);
    }
    std::map<Identity, int> known;
    for (const lint::Finding& finding : check(before, {.withConsequences = true})) {
        ++known[identityOf(finding, isRenaming, finding.location.file->path())];
    }
    const lint::Model after = draft.model();
    std::string text;
    for (const lint::Finding& finding : check(after, {.withConsequences = true})) {
        const std::string& path = finding.location.file->path();
        if (known[identityOf(finding, isRenaming, formerPaths[path])]-- <= 0) {
            text += fmt::format("{}:{}:{}: {} [{}]\n", path, finding.location.line, finding.location.column,
                                finding.text, finding.rule->code);
        }
    }
    return text;
}

diff::Comparison unmeant(diff::Comparison comparison, const Intention& intention) {
    dropNames(comparison.onlyInOld, intention.removed);
    dropNames(comparison.onlyInNew, intention.added);
    std::erase_if(comparison.general, [&intention](const diff::Change& change) {
        const std::string& topic = change.question.topic;
        const bool areFamilies = topic == diff::FAMILIES || topic == diff::FLASH_FAMILIES;
        return (areFamilies && isSubset(change.lost, intention.removed) &&
                isSubset(change.gained, intention.added)) ||
               std::any_of(intention.modes.begin(), intention.modes.end(), [&](const std::string& mode) {
                   return topic == diff::OUTPUTS_OF_MODE + mode && change.lost.empty();
               });
    });
    return comparison;
}

void requireMeant(const lint::Model& before, const Draft& draft, const std::vector<std::string>& layers,
                  const Intention& intention) {
    if (const std::string findings = newFindings(before, draft, intention); !findings.empty()) {
        throw CommandError(ExitCode::FAULT,
                           "nothing is written, since lint would find what it does not find now:\n" +
                               findings.substr(0, findings.size() - 1));
    }
    const std::optional<diff::Comparison> effect = effectOf(layers, draft.rewrites(), intention.renamed);
    if (!effect) {
        return;
    }
    const diff::Comparison rest = unmeant(*effect, intention);
    if (!rest.isEmpty()) {
        throw CommandError(ExitCode::FAULT, "nothing is written, since other answers would change:\n" +
                                                diff::asMarkdown(rest));
    }
}

} // namespace edit
