// Tells directories from single files on the command line.
#include "commands/DatabaseArguments.h"

#include <algorithm>
#include <filesystem>
#include <system_error>

DatabaseArguments::DatabaseArguments(const std::vector<std::string>& paths) {
    for (const std::string& path : paths) {
        std::error_code ignored;
        const bool isFile = std::filesystem::is_regular_file(path, ignored);
        const std::string parent = std::filesystem::path(path).parent_path().string();
        const std::string directory = !isFile ? path : parent.empty() ? "." : parent;
        if (isFile) {
            files.insert(
                (std::filesystem::path(directory) / std::filesystem::path(path).filename()).string());
        }
        if (std::find(directories.begin(), directories.end(), directory) == directories.end()) {
            directories.push_back(directory);
        }
    }
}
