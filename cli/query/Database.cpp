// Chooses the database: a named one that can't be used is a fault, never a silent change to another.
#include "query/Database.h"

#include "database/SearchPath.h"
#include "platform/Platform.h"
#include "query/Demonstration.h"
#include "term/ExitCode.h"
#include "term/Output.h"

#include <AcdReader.h>
#include <AcdStore.h>
#include <TarvikException.h>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <filesystem>
#include <iterator>
#include <system_error>

namespace {

CommandError unusable(const std::string& fault, const std::vector<std::string>& path) {
    return {ExitCode::FAULT, fmt::format("{}\ntried: \"{}\"", fault, fmt::join(path, "\", \""))};
}

void requireDirectories(const std::vector<std::string>& path) {
    for (const std::string& directory : path) {
        std::error_code fault;
        const std::filesystem::directory_iterator entries(acd::toPath(directory), fault);
        if (fault) {
            throw unusable(fmt::format("can't read the database \"{}\": {}", directory,
                                       fault.default_error_condition().message()),
                           path);
        }
    }
}

void requireBase(const std::vector<std::string>& path) {
    try {
        const AcdReader base;
    } catch (const DataNotFoundException&) {
        throw unusable("the database has no base.acd that can be read", path);
    }
}

} // namespace

std::vector<std::string> directoriesOf(const std::vector<std::string>& databases) {
    std::vector<std::string> all;
    for (const std::string& database : databases) {
        std::vector<std::string> layers = acd::splitDirectories(database);
        if (layers.empty()) {
            throw CommandError(ExitCode::FAULT, "a database has no directory: \"" + database + '"');
        }
        std::move(layers.begin(), layers.end(), std::back_inserter(all));
    }
    return all;
}

void openDatabase(const std::vector<std::string>& directories) {
    if (!directories.empty()) {
        AcdStore::setSearchPath(directories);
    }
    const std::vector<std::string> path = AcdStore::searchPath();
    if (path.empty()) {
        writeError("tarvik: no database given: answering from the built-in demonstration");
        AcdStore::setMemoryFiles(demonstrationFiles());
    }
    requireDirectories(path);
    requireBase(path);
}

std::vector<std::string> openDirectories(const std::vector<std::string>& directories) {
    if (!directories.empty()) {
        AcdStore::setSearchPath(directories);
    }
    std::vector<std::string> path = AcdStore::searchPath();
    if (path.empty()) {
        throw CommandError(ExitCode::FAULT,
                           "the built-in demonstration cannot be changed: name a directory with --database");
    }
    requireDirectories(path);
    return path;
}
