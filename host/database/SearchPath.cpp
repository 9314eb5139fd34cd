#include "database/SearchPath.h"

#include <array>
#include <climits>
#include <cstdlib>
#include <filesystem>
#include <new>
#include <system_error>
#include <utility>

#include <dlfcn.h>

// Where databases are looked for by default: in the directories of the environment, else beside the installed
// library.

namespace acd {

namespace {

/// The file of this code; empty while it is unknown. Memory that needs no release: the library may be unloaded, and
/// databases may be looked for at exit.
std::array<char, PATH_MAX> ownFile{};

/// Looks for it when the library is loaded: a relative name loses its meaning when the program changes its
/// directory.
[[gnu::constructor]] void rememberOwnFile() {
    try {
        const std::string file = findOwnFile();
        if (file.size() < ownFile.size()) {
            file.copy(ownFile.data(), file.size());
        }
    } catch (const std::bad_alloc&) {
        return; // There is no installed database then.
    }
}

} // namespace

std::string findOwnFile() {
    static const char anchor = 0;
    Dl_info information{};
    if (dladdr(&anchor, &information) == 0 || information.dli_fname == nullptr) {
        return {};
    }
    const std::filesystem::path file = information.dli_fname;
    std::error_code error;
    // A bare name is the program's own, as it was typed: the loader names libraries by their paths.
    return (file.has_parent_path() ? std::filesystem::absolute(file, error)
                                   : std::filesystem::read_symlink("/proc/self/exe", error))
        .string();
}

SearchPath defaultSearchPath() {
    // Not from the environment of a process that runs with more rights than its user has.
    if (const char* const list = secure_getenv("TARVIK_DATABASE"); list != nullptr) {
        if (std::vector<std::string> directories = splitDirectories(list); !directories.empty()) {
            return {std::move(directories), {}};
        }
    }
    return installedSearchPath(ownFile.data());
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
        return searchPath; // the place is unknown
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
