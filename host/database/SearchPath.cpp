#include "database/SearchPath.h"

#include "platform/Platform.h"

#include <filesystem>
#include <optional>
#include <system_error>
#include <utility>

// Where databases are looked for by default: in the directories of the environment, else beside the installed
// library.

namespace acd {

SearchPath defaultSearchPath() {
    if (const std::optional<std::string> list = platform::trustedVariable("TARVIK_DATABASE")) {
        if (std::vector<std::string> directories = splitDirectories(*list); !directories.empty()) {
            return {std::move(directories), {}};
        }
    }
    return installedSearchPath(platform::ownFile());
}

std::vector<std::string> splitDirectories(std::string_view list) {
    std::vector<std::string> directories;
    while (!list.empty()) {
        const std::string_view directory = list.substr(0, list.find(platform::listSeparator()));
        if (!directory.empty()) {
            directories.emplace_back(directory);
        }
        list.remove_prefix(directory.size());
        list = list.substr(list.empty() ? 0 : 1);
    }
    return directories;
}

SearchPath installedSearchPath(const std::string& library) {
    const std::filesystem::path directory = toPath(library).parent_path();
    SearchPath searchPath;
    if (directory.empty()) {
        return searchPath; // the place is unknown
    }
    // lib, or lib/<architecture>
    for (const char* const prefix : {"..", "../.."}) {
        const std::filesystem::path candidate = directory / prefix / "share" / "tarvik" / "database";
        std::error_code error;
        const std::filesystem::path found = std::filesystem::canonical(candidate, error);
        if (!error && std::filesystem::is_directory(found, error)) {
            return {{fromPath(found)}, {}};
        }
        searchPath.tried.push_back(fromPath(std::filesystem::weakly_canonical(candidate, error)));
    }
    return searchPath;
}

} // namespace acd
