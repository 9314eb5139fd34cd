#include "database/SearchPath.h"

#include <cstdlib>
#include <filesystem>
#include <system_error>
#include <utility>

#include <dlfcn.h>

// Where databases are looked for when nobody says so: what the environment and the place of the installed
// library have to say about it.

namespace acd {

namespace {

/// The file that this code was loaded from, as the loader names it.
[[nodiscard]] std::string ownLibrary() {
    static const char anchor = 0;
    Dl_info information{};
    return dladdr(&anchor, &information) != 0 && information.dli_fname != nullptr ? information.dli_fname
                                                                                  : "";
}

} // namespace

SearchPath defaultSearchPath() {
    // Not from the environment of a process that runs with more rights than its user has.
    if (const char* const list = secure_getenv("TARVIK_DATABASE"); list != nullptr) {
        if (std::vector<std::string> directories = splitDirectories(list); !directories.empty()) {
            return {std::move(directories), {}};
        }
    }
    return installedSearchPath(ownLibrary());
}

std::vector<std::string> splitDirectories(std::string_view list) {
    std::vector<std::string> directories;
    while (!list.empty()) {
        const std::string_view directory = list.substr(0, list.find(':'));
        if (!directory.empty()) {
            directories.emplace_back(directory);
        }
        list.remove_prefix(directory.size());
        list = list.substr(list.empty() ? 0 : 1);
    }
    return directories;
}

SearchPath installedSearchPath(const std::string& library) {
    const std::filesystem::path directory = std::filesystem::path(library).parent_path();
    SearchPath searchPath;
    if (directory.empty()) {
        return searchPath; // a bare name says nothing about its place
    }
    // lib, or lib/<architecture>
    for (const char* const prefix : {"..", "../.."}) {
        const std::filesystem::path candidate = directory / prefix / "share" / "tarvik" / "database";
        std::error_code error;
        const std::filesystem::path found = std::filesystem::canonical(candidate, error);
        if (!error && std::filesystem::is_directory(found, error)) {
            return {{found.string()}, {}};
        }
        searchPath.tried.push_back(std::filesystem::weakly_canonical(candidate, error).string());
    }
    return searchPath;
}

} // namespace acd
