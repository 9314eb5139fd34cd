#pragma once

#include <set>
#include <string>
#include <vector>

/// Directories and files of a database, as commands for authors take them.
struct DatabaseArguments {
    std::vector<std::string> directories; ///< the uppermost layer first; those of the files among them
    std::set<std::string> files;          ///< that are meant; empty: all files

    /// @param paths directories and files in any order
    explicit DatabaseArguments(const std::vector<std::string>& paths);

    [[nodiscard]] bool isMeant(const std::string& file) const {
        return files.empty() || files.contains(file);
    }
};
