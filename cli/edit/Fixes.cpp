// Applies the linter's fixes, and keeps those that do what they promise.
#include "edit/Fixes.h"

#include "edit/Scope.h"
#include "edit/SourceFile.h"
#include "edit/UnifiedDiff.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <map>
#include <set>
#include <tuple>

namespace edit {

namespace {

/// A file of the database and its text at the moment.
struct File {
    std::string path;
    std::string family;
    std::string original;
    std::string text;
};

/// A change of a file's text.
struct Change {
    std::size_t file;
    std::size_t offset;
    std::size_t length;
    std::string text;

    [[nodiscard]] auto place() const { return std::tuple(file, offset); }
};

/// What identifies a finding while lines move.
using Identity = std::tuple<const lint::Rule*, std::string, std::string>;
using Counts = std::map<Identity, std::size_t>;

Identity identityOf(const lint::Finding& finding) {
    return {finding.rule, finding.location.file->path(), finding.text};
}

std::string shown(const lint::Finding& finding) {
    return fmt::format("{}:{}:{}: {} [{}]", finding.location.file->path(), finding.location.line,
                       finding.location.column, finding.text, finding.rule->code);
}

Counts countsOf(const std::vector<lint::Finding>& findings) {
    Counts counts;
    for (const lint::Finding& finding : findings) {
        ++counts[identityOf(finding)];
    }
    return counts;
}

/// A fix, ready to be applied.
struct Candidate {
    Identity finding;
    std::string shown; ///< the finding with its place
    Scope scope;
    std::vector<Change> changes;
};

class Fixer {
public:
    Fixer(const std::vector<AcdLines>& files, const FixRequest& request) : m_request(request) {
        for (const AcdLines& file : files) {
            std::string text = file.readError().empty() ? readFile(file.path()) : std::string();
            m_files.push_back({file.path(), file.family(), text, text});
        }
        m_counts = findingsIn(texts());
    }

    [[nodiscard]] FixResult run() {
        // Overlapping fixes, and those that are only possible after others, need rounds of their own.
        constexpr int MAX_ROUNDS = 100;
        FixResult result;
        for (int round = 0; round < MAX_ROUNDS; ++round) {
            const std::size_t fixed = fixOnce();
            result.fixed += fixed;
            if (fixed == 0) {
                break;
            }
        }
        result.rewrites = rewrites(texts());
        for (const File& file : m_files) {
            if (file.text != file.original) {
                result.diffs.push_back(unifiedDiff(file.path, file.original, file.text));
            }
        }
        result.refused = std::move(m_refusals);
        result.effect = std::move(m_effect);
        return result;
    }

private:
    [[nodiscard]] lint::Model model(const std::vector<std::string>& texts) const {
        std::vector<AcdLines> files;
        for (std::size_t i = 0; i < m_files.size(); ++i) {
            files.emplace_back(texts[i], m_files[i].path, m_files[i].family);
        }
        return lint::Model(std::move(files));
    }

    [[nodiscard]] std::vector<std::string> texts() const {
        std::vector<std::string> all;
        for (const File& file : m_files) {
            all.push_back(file.text);
        }
        return all;
    }

    [[nodiscard]] Counts findingsIn(const std::vector<std::string>& texts) const {
        // Of all rules, since nothing new may come. A consequence is not new when its cause goes.
        return countsOf(check(model(texts), {.withConsequences = true}));
    }

    /// The fixes of the findings that are meant.
    [[nodiscard]] std::vector<Candidate> candidates() const {
        const lint::Model current = model(texts());
        const std::vector<const AcdLines*> files = current.files();
        std::map<std::size_t, SourceFile> sources;
        std::vector<Candidate> all;
        for (const lint::Finding& finding : check(current, m_request.selection)) {
            const bool isWanted = finding.fix && (finding.fix->isSafe || m_request.withUnsafe) &&
                                  m_request.isMeant(finding) && !m_refused.contains(identityOf(finding));
            if (!isWanted) {
                continue;
            }
            Candidate& candidate = all.emplace_back(
                Candidate{identityOf(finding), shown(finding), scopeOf(finding, current), {}});
            for (const lint::TextEdit& edit : finding.fix->edits) {
                const auto file = static_cast<std::size_t>(
                    std::find(files.begin(), files.end(), edit.location.file) - files.begin());
                const auto source =
                    sources.try_emplace(file, m_files[file].text, m_files[file].path, m_files[file].family)
                        .first;
                candidate.changes.push_back(changeOf(file, source->second, edit));
            }
        }
        return all;
    }

    [[nodiscard]] static Change changeOf(std::size_t file, const SourceFile& source,
                                         const lint::TextEdit& edit) {
        std::string text;
        for (const char byte : edit.text) {
            text += byte == '\n' ? std::string(source.lineEnd()) : std::string(1, byte);
        }
        return {file, source.offsetOf(edit.location.line, edit.location.column), edit.length, text};
    }

    /// The texts with these fixes; those that overlap one before them are left out.
    [[nodiscard]] std::vector<std::string> applied(const std::vector<Candidate>& candidates,
                                                   std::vector<Candidate>& used) const {
        std::vector<Change> changes;
        for (const Candidate& candidate : candidates) {
            const bool isFree = std::all_of(
                candidate.changes.begin(), candidate.changes.end(), [&changes](const Change& wanted) {
                    return std::none_of(changes.begin(), changes.end(), [&wanted](const Change& other) {
                        return wanted.file == other.file && wanted.offset <= other.offset + other.length &&
                               other.offset <= wanted.offset + wanted.length;
                    });
                });
            if (isFree) {
                changes.insert(changes.end(), candidate.changes.begin(), candidate.changes.end());
                used.push_back(candidate);
            }
        }
        std::sort(changes.begin(), changes.end(),
                  [](const Change& left, const Change& right) { return left.place() > right.place(); });
        std::vector<std::string> edited = texts();
        for (const Change& change : changes) {
            edited[change.file].replace(change.offset, change.length, change.text);
        }
        return edited;
    }

    /// A finding that the fixes do not remove or that they add; null if each finding is removed and no other is added.
    [[nodiscard]] const Identity* findingAfter(const std::vector<Candidate>& used,
                                               const Counts& after) const {
        Counts left = m_counts;
        for (const Candidate& candidate : used) {
            --left[candidate.finding];
        }
        const auto found = std::find_if(after.begin(), after.end(), [&left](const auto& each) {
            const auto known = left.find(each.first);
            return known == left.end() || each.second > known->second;
        });
        return found == after.end() ? nullptr : &found->first;
    }

    [[nodiscard]] std::vector<Rewrite> rewrites(const std::vector<std::string>& texts) const {
        std::vector<Rewrite> all;
        for (std::size_t i = 0; i < m_files.size(); ++i) {
            if (texts[i] != m_files[i].original) {
                all.push_back({m_files[i].path, texts[i]});
            }
        }
        return all;
    }

    /// Which names do these fixes, and those before them, change answers about that no finding concerns?
    [[nodiscard]] std::set<std::string> strangers(const std::vector<Candidate>& used,
                                                  const std::optional<diff::Comparison>& effect) const {
        if (!effect || m_request.withUnsafe) {
            return {};
        }
        Scope scope = m_scope;
        for (const Candidate& candidate : used) {
            scope.add(candidate.scope);
        }
        return namesOutside(scope, *effect);
    }

    /// @return how many findings were fixed
    [[nodiscard]] std::size_t fix(const std::vector<Candidate>& wanted) {
        std::vector<Candidate> used;
        std::vector<std::string> edited = applied(wanted, used);
        if (used.empty()) {
            return 0;
        }
        Counts after = findingsIn(edited);
        const auto refuse = [&](const std::string& reason) {
            if (wanted.size() == 1) {
                m_refusals.insert(fmt::format("{}\n{}", used.front().shown, reason));
            }
            return std::size_t{0};
        };
        if (const Identity* const found = findingAfter(used, after)) {
            return refuse(fmt::format("its fix would leave the finding: {} [{}]", std::get<2>(*found),
                                      std::get<0>(*found)->code));
        }
        std::optional<diff::Comparison> effect = effectOf(m_request.layers, rewrites(edited));
        if (const std::set<std::string> others = strangers(used, effect); !others.empty()) {
            return refuse(fmt::format("its fix would change answers about {}, too, and needs --unsafe-fixes",
                                      fmt::join(others, ", ")));
        }
        for (std::size_t i = 0; i < m_files.size(); ++i) {
            m_files[i].text = std::move(edited[i]);
        }
        for (const Candidate& candidate : used) {
            m_scope.add(candidate.scope);
        }
        m_counts = std::move(after);
        m_effect = std::move(effect);
        return used.size();
    }

    [[nodiscard]] std::size_t fixOnce() {
        const std::vector<Candidate> all = candidates();
        if (const std::size_t fixed = fix(all); fixed != 0) {
            return fixed;
        }
        // One of them spoils it: each by itself, until one has moved the places of the others.
        for (const Candidate& candidate : all) {
            if (fix({candidate}) != 0) {
                return 1;
            }
            m_refused.insert(candidate.finding);
        }
        return 0;
    }

    const FixRequest& m_request;
    std::vector<File> m_files;
    Counts m_counts;                          ///< of the findings in the current texts
    Scope m_scope;                            ///< of what is fixed so far
    std::optional<diff::Comparison> m_effect; ///< of the same
    std::set<Identity> m_refused;             ///< whose fixes do not do what they promise
    std::set<std::string> m_refusals;         ///< the same, with the reasons
};

} // namespace

FixResult fixFindings(const std::vector<AcdLines>& files, const FixRequest& request) {
    return Fixer(files, request).run();
}

} // namespace edit
