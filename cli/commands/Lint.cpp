// `lint`: reports what is wrong with a database, by file, line and column.
#include "commands/Commands.h"
#include "commands/DatabaseArguments.h"

#include "diff/Presentation.h"
#include "edit/FileWriter.h"
#include "edit/Fixes.h"
#include "lint/Check.h"
#include "lint/Report.h"
#include "platform/Platform.h"
#include "query/Database.h"
#include "query/Tool.h"
#include "term/Progress.h"
#include "term/Table.h"

#include <AcdStore.h>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <charconv>
#include <cstddef>
#include <fstream>
#include <iterator>
#include <memory>
#include <optional>
#include <set>
#include <utility>

namespace {

struct Arguments {
    std::vector<std::string> directories;
    std::vector<std::string> selected;
    std::vector<std::string> ignored;
    std::vector<std::string> explained;
    std::string format = "text";
    std::string baseline;
    std::optional<std::string> most;
    bool strict = false;
    bool fix = false;
    bool unsafeFixes = false;
    bool diff = false;
};

using Rules = std::set<const lint::Rule*>;

/// The rules of several codes. A code that matches no rule would silently select, or ignore, nothing.
Rules rulesOf(const std::vector<std::string>& codes) {
    Rules all;
    for (const std::string& code : codes) {
        const std::vector<const lint::Rule*> found = code == "all" ? lint::rules() : lint::rulesOf(code);
        if (found.empty()) {
            throw CommandError(
                ExitCode::FAULT,
                fmt::format("no code begins with \"{}\"; see: tarvik lint --explain all", code));
        }
        all.insert(found.begin(), found.end());
    }
    return all;
}

struct Explanations {
    std::vector<const lint::Rule*> rules;
};

std::string indented(std::string_view text) {
    std::string result = "    ";
    for (const char byte : text) {
        result += byte;
        result += byte == '\n' ? "    " : "";
    }
    return result + '\n';
}

std::string asText(const Explanations& explanations, const Terminal& terminal) {
    std::string text;
    for (const lint::Rule* rule : explanations.rules) {
        const std::string title =
            fmt::format("{} ({}), {}: {}", rule->slug, rule->code, nameOf(rule->severity), rule->title);
        const std::vector<std::string> explanation =
            lines(wordsOf(rule->explanation()), terminal.width(), "");
        text += fmt::format("{}{}\n\n{}\n", text.empty() ? "" : "\n", terminal.heading(title),
                            fmt::join(explanation, "\n"));
        if (!rule->example.empty()) {
            text += "\nFound in:\n\n" + indented(rule->example);
        }
    }
    return text;
}

Json asJson(const Explanations& explanations) {
    Json list = Json::array();
    for (const lint::Rule* rule : explanations.rules) {
        list.push_back({{"code", rule->code},
                        {"name", rule->slug},
                        {"subject", subjectOf(*rule)},
                        {"level", nameOf(rule->severity)},
                        {"title", rule->title},
                        {"explanation", rule->explanation()},
                        {"example", rule->example}});
    }
    return {{"rules", list}};
}

ExitCode explain(Tool& tool, const Arguments& arguments) {
    const Rules wanted = rulesOf(arguments.explained);
    Explanations explanations;
    std::copy_if(lint::rules().begin(), lint::rules().end(), std::back_inserter(explanations.rules),
                 [&](const lint::Rule* rule) { return wanted.contains(rule); });
    return tool.answer(explanations);
}

/// The fingerprints of a former report.
std::set<std::string> readBaseline(const std::string& path) {
    std::ifstream file(acd::toPath(path), std::ios::binary);
    const Json report = file ? Json::parse(file, nullptr, false) : Json();
    if (!report.is_object() || !report.contains("findings") || !report["findings"].is_array()) {
        throw CommandError(ExitCode::FAULT,
                           fmt::format("{} is not a report of: tarvik lint --format json", printable(path)));
    }
    std::set<std::string> fingerprints;
    for (const Json& finding : report["findings"]) {
        if (finding.is_object() && finding.contains("fingerprint") && finding["fingerprint"].is_string()) {
            fingerprints.insert(finding["fingerprint"].get<std::string>());
        }
    }
    return fingerprints;
}

void dropKnown(lint::Report& report, const std::string& baseline) {
    const std::set<std::string> known = readBaseline(baseline);
    const std::vector<std::string> names = fingerprints(report.findings);
    std::vector<lint::Finding> kept;
    for (std::size_t i = 0; i < names.size(); ++i) {
        if (!known.contains(names[i])) {
            kept.push_back(std::move(report.findings[i]));
        }
    }
    report.findings = std::move(kept);
}

std::size_t readCount(const std::string& text) {
    std::size_t count = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), count);
    if (error != std::errc() || end != text.data() + text.size()) {
        throw CommandError(ExitCode::FAULT, fmt::format("--max needs a number, not \"{}\"", printable(text)));
    }
    return count;
}

std::string hintOfFixes(const lint::Report& report) {
    const auto fixable =
        std::count_if(report.findings.begin(), report.findings.end(),
                      [](const lint::Finding& finding) { return finding.fix && finding.fix->isSafe; });
    return fixable == 0 ? std::string() : fmt::format("\n{} can be fixed by --fix", fixable);
}

/// Shows findings as text, and how many there are of each rule.
ExitCode showText(Tool& tool, lint::Report report, const Arguments& arguments, ExitCode status) {
    const std::size_t found = report.findings.size();
    const std::size_t shown = arguments.most ? std::min(readCount(*arguments.most), found) : found;
    if (found != 0) {
        tool.note(fmt::format("{}{}\n{}{}", summary(report),
                              arguments.most ? fmt::format("; {} shown", shown) : std::string(),
                              countsByCode(report), hintOfFixes(report)));
    }
    report.findings.erase(report.findings.begin() + static_cast<std::ptrdiff_t>(shown),
                          report.findings.end());
    return tool.answer(report, status);
}

ExitCode show(Tool& tool, lint::Report report, const Arguments& arguments, bool isComplete) {
    const bool isRefused =
        report.count(lint::Severity::ERROR) != 0 || (arguments.strict && !report.findings.empty());
    const ExitCode status = !isComplete ? ExitCode::FAULT : isRefused ? ExitCode::NO : ExitCode::YES;
    if (arguments.format == "text") {
        return showText(tool, std::move(report), arguments, status);
    }
    std::string text;
    if (arguments.format == "github") {
        text = asGithub(report);
    } else if (arguments.format == "sarif") {
        text = oneLine(asSarif(report)) + '\n';
    } else {
        Json document{{"version", 1}};
        document.update(asJson(report));
        document["messages"] = Json::array();
        text = oneLine(document) + '\n';
    }
    tool.output().write(text);
    tool.output().flush();
    return status;
}

/// Fixes findings, and writes the files unless only the difference is wanted.
/// @return the files as they are then
std::vector<AcdLines> fixed(Tool& tool, std::vector<AcdLines> files, const lint::Selection& selection,
                            const Arguments& arguments, const DatabaseArguments& database) {
    const std::vector<std::string> directories = AcdStore::searchPath();
    if (directories.empty()) {
        throw CommandError(ExitCode::FAULT, "the built-in demonstration cannot be changed: name a directory");
    }
    const edit::FixResult result =
        edit::fixFindings(files, {selection, arguments.unsafeFixes,
                                  [&database](const lint::Finding& finding) {
                                      return database.isMeant(finding.location.file->path());
                                  },
                                  directories});
    for (const std::string& refused : result.refused) {
        tool.note("not fixed: " + refused);
    }
    if (arguments.diff) {
        tool.output().write(fmt::format("{}", fmt::join(result.diffs, "")));
        return files;
    }
    if (result.fixed == 0) {
        return files;
    }
    edit::writeAll(result.rewrites);
    std::string note =
        fmt::format("fixed {} finding{} in {} file{}", result.fixed, result.fixed == 1 ? "" : "s",
                    result.rewrites.size(), result.rewrites.size() == 1 ? "" : "s");
    if (result.effect && !result.effect->isEmpty()) {
        note += "; answers that change:\n" + diff::asMarkdown(*result.effect);
    }
    tool.note(note);
    for (AcdLines& file : files) {
        const auto rewrite =
            std::find_if(result.rewrites.begin(), result.rewrites.end(),
                         [&file](const edit::Rewrite& each) { return each.path == file.path(); });
        if (rewrite != result.rewrites.end()) {
            file = AcdLines(*rewrite->text, std::string(file.path()), std::string(file.family()));
        }
    }
    return files;
}

ExitCode run(Tool& tool, const Arguments& arguments) {
    if (arguments.format == "json") {
        tool.useJson();
    }
    lint::Selection selection{rulesOf(arguments.selected), rulesOf(arguments.ignored)};
    if (!arguments.explained.empty()) {
        return explain(tool, arguments);
    }
    const DatabaseArguments database(arguments.directories);
    if (database.directories.empty()) {
        tool.openDatabase();
    } else {
        ::openDatabase(database.directories);
    }
    std::vector<AcdLines> files = AcdLines::ofDatabase();
    if (arguments.fix || arguments.unsafeFixes || arguments.diff) {
        files = fixed(tool, std::move(files), selection, arguments, database);
    }
    selection.isMeant = [&database](const lint::Finding& finding) {
        return database.isMeant(finding.location.file->path());
    };
    std::vector<std::string> unusedIndexes = lint::unusedIndexes(lint::layersOf(files));
    const lint::Model model(std::move(files), std::move(unusedIndexes));
    // The rules report the readers' faults, too, with a code.
    static_cast<void>(tool.messages().take());
    Progress progress("looking for findings");
    lint::Report report{check(
        model, selection, [&progress](std::size_t done, std::size_t total) { progress.reach(done, total); })};
    if (!arguments.baseline.empty()) {
        dropKnown(report, arguments.baseline);
    }
    return show(tool, std::move(report), arguments, model.isComplete());
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        {.name = "DIR",
         .description =
             "The directories of the database, the uppermost layer first, or one of its files; without them, "
             "the database that the other commands use",
         .kind = ValueKind::PATH,
         .target = &arguments->directories},
        {.name = "--select",
         .value = "CODE",
         .description = "Report only rules whose code starts with one of these prefixes (comma-separated)",
         .kind = ValueKind::LINT_CODE,
         .isCommaSeparated = true,
         .target = &arguments->selected},
        {.name = "--ignore",
         .value = "CODE",
         .description = "Do not report rules whose code starts with one of these prefixes (comma-separated)",
         .kind = ValueKind::LINT_CODE,
         .isCommaSeparated = true,
         .target = &arguments->ignored},
        {.name = "--explain",
         .value = "CODE",
         .description =
             "Explain the rules whose code starts with one of these prefixes (comma-separated), or all",
         .kind = ValueKind::LINT_CODE,
         .isCommaSeparated = true,
         .target = &arguments->explained},
        {.name = "--format",
         .value = "FORMAT",
         .description = "The form of the result",
         .kind = ValueKind::CHOICE,
         .choices = {"text", "json", "sarif", "github"},
         .target = &arguments->format},
        {.name = "--baseline",
         .value = "FILE",
         .description = "Do not report the findings of this former report, written by --format json",
         .kind = ValueKind::PATH,
         .target = &arguments->baseline},
        {.name = "--max",
         .value = "N",
         .description = "Print at most N findings",
         .target = &arguments->most},
        {.name = "--fix",
         .description = "Remove the findings that can be fixed safely, and write the files",
         .target = &arguments->fix},
        {.name = "--unsafe-fixes",
         .description = "Apply guesses as well, such as the nearest name, and fixes that change answers "
                        "about other names",
         .target = &arguments->unsafeFixes},
        {.name = "--diff",
         .description = "Write nothing; show what --fix would change",
         .target = &arguments->diff},
        {.name = "--strict",
         .description = "Exit with status 1 for warnings, too",
         .target = &arguments->strict},
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::LINT{
    "lint",
    "Check a database for mistakes",
    "",
    "tarvik lint database\n"
    "tarvik lint site company --strict --format sarif\n"
    "tarvik lint --fix database\n"
    "tarvik lint --explain T105",
    declare,
};
