// `diff`: which answers two databases give differently.
#include "commands/Declarations.h"

#include "Tool.h"
#include "diff/Comparison.h"

#include <CLI/CLI.hpp>

#include <memory>
#include <sstream>

namespace {

struct Arguments {
    std::string oldDatabase;
    std::string newDatabase;
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
        throw Failure(Status::FAULT, "a database has no directory: \"" + text + '"');
    }
    return directories;
}

Status run(Tool& tool, const Arguments& arguments) {
    const std::vector<std::string> oldLayers = layers(arguments.oldDatabase);
    const std::vector<std::string> newLayers = layers(arguments.newDatabase);
    const diff::Names oldNames = diff::namesOf(oldLayers);
    const diff::Names newNames = diff::namesOf(newLayers);
    const diff::Names common = diff::commonNames(oldNames, newNames);
    const diff::Comparison comparison =
        compare(oldNames, newNames, diff::factsOf(oldLayers, common), diff::factsOf(newLayers, common));
    return tool.answer(comparison, comparison.isEmpty() ? Status::YES : Status::NO);
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
    return [arguments](Tool& tool) { return run(tool, *arguments); };
}
