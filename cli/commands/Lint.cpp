// `lint`: reports what is wrong with a database, by file, line and column.
#include "commands/Commands.h"

#include "lint/Report.h"
#include "lint/Suppressions.h"
#include "query/Database.h"
#include "query/Tool.h"
#include "term/Progress.h"
#include "term/Table.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <charconv>
#include <iterator>
#include <memory>
#include <set>

namespace {

struct Arguments {
    std::vector<std::string> directories;
    std::vector<std::string> selected;
    std::vector<std::string> ignored;
    std::vector<std::string> explained;
    std::string format = "text";
    bool strict = false;
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

lint::Report examine(const lint::Model& model, const Rules& selected, const Rules& ignored) {
    lint::Findings findings;
    Progress progress("looking for findings");
    std::size_t done = 0;
    for (const lint::RuleSet& set : lint::ruleSets()) {
        if (set.check != nullptr) {
            set.check(model, findings);
        }
        progress.reach(++done, lint::ruleSets().size());
    }
    // Comments first: one that suppresses a finding is used, even if that finding is not selected.
    std::vector<lint::Finding> all = lint::withoutSuppressed(model, findings);
    std::erase_if(all, [&](const lint::Finding& finding) {
        return (!selected.empty() && !selected.contains(finding.rule)) || ignored.contains(finding.rule);
    });
    return {lint::sorted(std::move(all), model)};
}

ExitCode show(Tool& tool, const lint::Report& report, const Arguments& arguments) {
    const bool isRefused =
        report.count(lint::Severity::ERROR) != 0 || (arguments.strict && !report.findings.empty());
    const ExitCode status = isRefused ? ExitCode::NO : ExitCode::YES;
    if (arguments.format == "text") {
        if (!report.findings.empty()) {
            tool.note(summary(report));
        }
        return tool.answer(report, status);
    }
    Json document;
    if (arguments.format == "sarif") {
        document = asSarif(report);
    } else {
        document = {{"version", 1}};
        document.update(asJson(report));
        document["messages"] = Json::array();
    }
    tool.output().write(oneLine(document) + '\n');
    tool.output().flush();
    return status;
}

ExitCode run(Tool& tool, const Arguments& arguments) {
    const Rules selected = rulesOf(arguments.selected);
    const Rules ignored = rulesOf(arguments.ignored);
    if (!arguments.explained.empty()) {
        return explain(tool, arguments);
    }
    if (arguments.directories.empty()) {
        tool.openDatabase();
    } else {
        ::openDatabase(arguments.directories);
    }
    const lint::Model model(AcdLines::ofDatabase());
    // The rules report the readers' faults, too, with a code.
    static_cast<void>(tool.messages().take());
    return show(tool, examine(model, selected, ignored), arguments);
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
         .description = "Print at most N findings, and how many there are of each rule",
         .target = &arguments->most},
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
    "tarvik lint --explain T105",
    declare,
};
