// `diff`: which answers two databases give differently.
#include "commands/Commands.h"

#include "diff/Presentation.h"
#include "query/Tool.h"

#include <CLI/CLI.hpp>

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

} // namespace

Action declareDiff(CLI::App& parser) {
    auto arguments = std::make_shared<Arguments>();
    parser
        .add_option("OLD", arguments->oldDatabase,
                    "A database: its directory, or its layers with \":\" between")
        ->required()
        ->type_name("");
    parser.add_option("NEW", arguments->newDatabase, "The database to hold against it")
        ->required()
        ->type_name("");
    parser.add_option("--format", arguments->format, "How to tell it: text, or markdown for release notes")
        ->check(CLI::IsMember({"text", "markdown"}))
        ->type_name("FORMAT");
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}
