// `lint`: what is wrong with a database, by file, line and column.
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
#include <memory>

namespace {

struct Arguments {
    std::vector<std::string> directories;
    std::vector<std::string> selected;
    std::vector<std::string> ignored;
    std::vector<std::string> explained;
    std::string format = "text";
    bool strict = false;
};

bool beginsWithAny(std::string_view code, const std::vector<std::string>& prefixes) {
    return std::any_of(prefixes.begin(), prefixes.end(),
                       [code](const std::string& prefix) { return code.starts_with(prefix); });
}

/// A prefix that fits no code would silently select, or ignore, nothing.
void requireCodes(const std::vector<std::string>& prefixes) {
    for (const std::string& prefix : prefixes) {
        const bool isKnown =
            std::any_of(lint::rules().begin(), lint::rules().end(),
                        [&](const lint::Rule* rule) { return rule->code.starts_with(prefix); });
        if (prefix.empty() || !isKnown) {
            throw CommandError(
                ExitCode::FAULT,
                fmt::format("no code begins with \"{}\"; see: tarvik lint --explain all", prefix));
        }
    }
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
        const std::string title = fmt::format("{} ({}): {}", rule->code, nameOf(rule->level), rule->title);
        const std::vector<std::string> explanation =
            lines(wordsOf(std::string(rule->explanation)), terminal.width(), "");
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
                        {"level", nameOf(rule->level)},
                        {"title", rule->title},
                        {"explanation", rule->explanation},
                        {"example", rule->example}});
    }
    return {{"rules", list}};
}

ExitCode explain(Tool& tool, const Arguments& arguments) {
    const bool all =
        std::find(arguments.explained.begin(), arguments.explained.end(), "all") != arguments.explained.end();
    if (!all) {
        requireCodes(arguments.explained);
    }
    Explanations explanations;
    for (const lint::Rule* rule : lint::rules()) {
        if (all || beginsWithAny(rule->code, arguments.explained)) {
            explanations.rules.push_back(rule);
        }
    }
    return tool.answer(explanations);
}

bool isWanted(std::string_view code, const Arguments& arguments) {
    return (arguments.selected.empty() || beginsWithAny(code, arguments.selected)) &&
           !beginsWithAny(code, arguments.ignored);
}

lint::Report examine(const lint::Model& model, const Arguments& arguments) {
    lint::Findings findings;
    Progress progress("looking for findings");
    std::size_t done = 0;
    for (const lint::Group& group : lint::groups()) {
        if (group.check != nullptr) {
            group.check(model, findings);
        }
        progress.reach(++done, lint::groups().size());
    }
    // Comments first: one that ignores a finding is used, whether or not that finding is wanted.
    std::vector<lint::Finding> all = lint::withoutIgnored(model, findings);
    std::erase_if(all,
                  [&](const lint::Finding& finding) { return !isWanted(finding.rule->code, arguments); });
    return {lint::sorted(std::move(all), model)};
}

ExitCode show(Tool& tool, const lint::Report& report, const Arguments& arguments) {
    const bool isRefused =
        report.count(lint::Level::ERROR) != 0 || (arguments.strict && !report.findings.empty());
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
    requireCodes(arguments.selected);
    requireCodes(arguments.ignored);
    if (!arguments.explained.empty()) {
        return explain(tool, arguments);
    }
    if (arguments.directories.empty()) {
        tool.openDatabase();
    } else {
        ::openDatabase(arguments.directories);
    }
    const lint::Model model(AcdLines::ofDatabase());
    // What the readers said of the lines is found again, with a code.
    static_cast<void>(tool.messages().take());
    return show(tool, examine(model, arguments), arguments);
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        {.name = "DIR",
         .description =
             "The directories of the database, the uppermost layer first; without them, the database "
             "that the other commands use",
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
         .choices = {"text", "json", "sarif"},
         .target = &arguments->format},
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
