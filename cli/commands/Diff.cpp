// `diff`: which answers two databases give differently.
#include "commands/Commands.h"

#include "diff/Presentation.h"
#include "query/Tool.h"

#include <memory>
#include <sstream>

namespace {

struct Arguments {
    std::string oldDatabase;
    std::string newDatabase;
    std::string format = "text";
};

/// The directories of a database whose layers are separated by ":".
std::vector<std::string> layers(const std::string& text) {
    std::vector<std::string> directories;
    std::istringstream rest(text);
    for (std::string directory; std::getline(rest, directory, ':');) {
        if (!directory.empty()) {
            directories.push_back(directory);
        }
    }
    if (directories.empty()) {
        throw CommandError(ExitCode::FAULT, "a database has no directory: \"" + text + '"');
    }
    return directories;
}

/// A comparison as release notes show it.
struct ReleaseNotes {
    const diff::Comparison& comparison;
};

std::string asText(const ReleaseNotes& notes, const Terminal& /*any*/) {
    return diff::asMarkdown(notes.comparison);
}
Json asJson(const ReleaseNotes& notes) { return diff::asJson(notes.comparison); }

ExitCode run(Tool& tool, const Arguments& arguments) {
    const auto [oldFacts, newFacts] =
        diff::factsOf(layers(arguments.oldDatabase), layers(arguments.newDatabase));
    const diff::Comparison comparison = diff::compare(oldFacts, newFacts);
    const ExitCode status = comparison.isEmpty() ? ExitCode::YES : ExitCode::NO;
    return arguments.format == "markdown" ? tool.answer(ReleaseNotes{comparison}, status)
                                          : tool.answer(comparison, status);
}

Action declare(ArgumentList& list) {
    auto arguments = std::make_shared<Arguments>();
    list = {
        {.name = "OLD",
         .description = "The old database: its directory, or its layers separated by \":\"",
         .kind = ValueKind::PATH,
         .required = true,
         .target = &arguments->oldDatabase},
        {.name = "NEW",
         .description = "The new database",
         .kind = ValueKind::PATH,
         .required = true,
         .target = &arguments->newDatabase},
        {.name = "--format",
         .value = "FORMAT",
         .description = "The form of the result; markdown is for release notes",
         .kind = ValueKind::CHOICE,
         .choices = {"text", "markdown"},
         .target = &arguments->format},
    };
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}

} // namespace

const Command command::DIFF{
    "diff",
    "Compare the answers of two databases",
    "Lists the answers that differ. The layers of a database are separated by \":\".",
    "tarvik diff database changed\n"
    "tarvik diff company site:company --json\n"
    "tarvik diff released database --format markdown",
    declare,
};
