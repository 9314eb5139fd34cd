// Tells directories from single files on the command line.
#include "commands/DatabaseArguments.h"

#include "platform/Platform.h"

#include <algorithm>
#include <filesystem>
#include <system_error>

DatabaseArguments::DatabaseArguments(const std::vector<std::string>& paths) {
    for (const std::string& path : paths) {
        std::error_code ignored;
        const bool isFile = std::filesystem::is_regular_file(acd::toPath(path), ignored);
        const std::string parent = acd::fromPath(acd::toPath(path).parent_path());
        const std::string directory = !isFile ? path : parent.empty() ? "." : parent;
        if (isFile) {
            files.insert(acd::fromPath(acd::toPath(directory) / acd::toPath(path).filename()));
        }
        if (std::find(directories.begin(), directories.end(), directory) == directories.end()) {
            directories.push_back(directory);
        }
    }
}
