#pragma once

#include "cli/support/DatabaseDirectory.h"

#include "edit/SourceFile.h"
#include "platform/Platform.h"

/// The names and texts of a directory's files.
inline DatabaseDirectory::Files textsIn(const DatabaseDirectory& directory) {
    DatabaseDirectory::Files files;
    for (const auto& entry : std::filesystem::directory_iterator(directory.path())) {
        const std::string name = acd::fromPath(entry.path().filename());
        files[name] = edit::readFile(directory.path(name));
    }
    return files;
}
